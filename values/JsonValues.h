// Values of tags as JSON. Pure.
#pragma once

#include <nlohmann/json.hpp>

#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace values {

/// The order of the members is the order of their creation.
using Json = nlohmann::ordered_json;

/// @param value  Run-time form, shape.bytes bytes.
/// @return true or false, a number, an array, or a text. Infinite reals and NaNs are texts, as are
/// binary values ("0x..."); a string that is not UTF-8 is the array of its bytes.
Json jsonValue(ValueShape shape, ByteView value);

}  // namespace values
