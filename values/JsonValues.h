// Values of tags as JSON. Pure.
#pragma once

#include <nlohmann/json.hpp>

#include "values/Json.h"
#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace values {

/// @param value  Run-time form, shape.bytes bytes.
/// @return true or false, a number, an array, or a text. Infinite reals and NaNs are texts, as are
/// binary values ("0x..."); a string that is not UTF-8 is the array of its bytes.
Json jsonValue(ValueShape shape, ByteView value);

}  // namespace values
