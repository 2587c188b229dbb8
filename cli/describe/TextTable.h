// Plain tables for a terminal. Pure.
#pragma once

#include <string>
#include <vector>

namespace cli {

/// Lays rows out in columns that are two blanks apart; the first row is the heading.
/// A long text in the last column is wrapped at ", " or a blank and goes on below itself.
/// @param width  Where the last column wraps, in characters of the whole line; words longer than
/// the space are not cut.
std::string textTable(const std::vector<std::vector<std::string>>& rows, std::size_t width = 100);

}  // namespace cli
