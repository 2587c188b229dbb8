// The name that was probably meant. Pure.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace values {

/// @return the edits that lead from one word to the other: characters inserted, left out, replaced,
/// or two neighbours exchanged. Upper and lower case count as equal.
std::size_t editDistance(std::string_view a, std::string_view b);

/// @return the first of the nearest names; empty when none is near: more than a third of the
/// word's characters, and at least two, would have to change.
std::string nearestName(std::string_view word, const std::vector<std::string>& names);

}  // namespace values
