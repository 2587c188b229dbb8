// Values of tags as text and back. Pure.
//
// boolean        0 or 1 (true and false are understood too)
// whole numbers  decimal; 0x... is understood too
// float, double  the shortest text that reads back exactly; inf, nan
// string-N       text in double quotes, zeroes at its end left out; quotes are optional on input
// binary-N       0x and two hexadecimal digits a byte, all N of them; 0x is optional on input
// arrays         the items, separated by commas, all of them
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace values {

/// @return the value in run-time form, exactly shape.bytes bytes.
/// Errors: ValueError when the text is no value of that type: wrong form, out of range,
/// wrong item count, text too long, or a type that has no text form (time, object).
Bytes parseValue(ValueShape shape, std::string_view text);

/// @return the texts of a value's items: an array's, between the commas; else the text as it is.
/// Errors: ValueError when there are more or fewer than the array has.
std::vector<std::string_view> itemTexts(ValueShape shape, std::string_view text);

/// @param value  Run-time form, shape.bytes bytes.
/// @return text that parseValue() turns into the same bytes; types without a text form are shown
/// like binary.
std::string formatValue(ValueShape shape, ByteView value);

/// @return one value that is no array; `value` has its type's length.
std::string formatItem(const ValueType& type, ByteView value);

/// @return the text without the zeroes that fill it up.
ByteView withoutPadding(ByteView text);

}  // namespace values
