// Several data types at once, as a driver's description writes them: one bit for each. Pure.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace values {

/// @return the bit of a type's name, "-" of an array included; 0 for a name of no type.
std::uint32_t typeMask(std::string_view name);

/// @return the names of the types of a mask, in the order of their codes.
std::vector<std::string_view> typeNames(std::uint32_t mask);

/// @return the names of a mask, e.g. "boolean, boolean-"; where most are in it, "all but ...".
std::string typesText(std::uint32_t mask);

}  // namespace values
