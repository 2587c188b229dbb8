// Numbers as text. Pure; blanks and tabs around a number are ignored.
//
// Every function that reads text answers with the number's bits in the low `bytes` bytes, and
// fails with ValueError, whose text names the offending text and the accepted range.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "values/ValueTypes.h"

namespace values {

/// @return the text without blanks and tabs at both ends.
std::string_view trimmed(std::string_view text);

/// Reads "0", "1", "false" or "true".
std::uint64_t parseBoolean(std::string_view text);

/// Reads a decimal number or, behind "0x", a hexadecimal one, with an optional sign in front.
/// A leading zero means nothing. The number must lie in the type's range.
std::uint64_t parseWhole(const ValueType& type, std::string_view text);
std::string formatWhole(const ValueType& type, std::uint64_t bits);

/// Reads a decimal number ("1.5e-3"), a hexadecimal one ("0x1.8p3"), "inf", "nan" or, for a NaN
/// with a pattern of its own, "nan(0x7f800001)". A number too large or too small for the type is
/// refused rather than turned into infinity or zero.
std::uint64_t parseReal(const ValueType& type, std::string_view text);

/// @return the shortest text that parseReal() turns into the same bits again.
std::string formatReal(const ValueType& type, std::uint64_t bits);

/// @return the range of a whole-number type, e.g. "-128..127".
std::string rangeText(const ValueType& type);

}  // namespace values
