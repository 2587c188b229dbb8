// Versions of the C library's symbols. Pure.
#pragma once

#include <string>
#include <vector>

namespace cli {

/// @return the highest of the versions "GLIBC_x.y[.z]" among the names, as "x.y[.z]", compared by
/// number; empty when there is none. Other names, "GLIBC_PRIVATE" too, do not count.
std::string newestGlibc(const std::vector<std::string>& versions);

}  // namespace cli
