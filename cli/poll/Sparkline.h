// The last values of a tag as a row of small bars. Pure.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace cli {

/// @return one bar a value, the last `width` of them: the smallest the lowest, the largest the
/// highest; all of one height when they are equal. What is no number is a blank.
/// @param unicode  false: bars of ASCII characters.
std::string sparkline(const std::vector<double>& values, std::size_t width, bool unicode);

}  // namespace cli
