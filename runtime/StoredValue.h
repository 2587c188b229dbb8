// A value of the permanent storage and what it reads as when asked for another type.
#pragma once

#include <string>
#include <variant>

namespace runtime {

/// Text, boolean or integer, as it was written.
using StoredValue = std::variant<std::string, bool, int>;

/// Text as it is; a boolean as "1" or "0"; an integer in decimal.
std::string storedText(const StoredValue& value);

/// An integer as it is; a boolean as 1 or 0; text as strtol() with base 0 reads it: leading
/// blanks, a sign, "0x" for hexadecimal, a leading 0 for octal, up to the first character that
/// does not fit; 0 when there is no number; the nearest int when it is beyond the range.
int storedInt(const StoredValue& value);

/// A boolean as it is; an integer unless it is 0; text when it is "true" or storedInt() of it is
/// not 0.
bool storedBool(const StoredValue& value);

/// "text", "bool" or "int".
const char* storedTypeName(const StoredValue& value);

}  // namespace runtime
