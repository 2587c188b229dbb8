// Checks of the words behind options, each of which says what is accepted.
#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

namespace cli {

/// Refuses an empty word, which would pass for none.
CLI::Validator notEmpty();

/// Takes the choices, and as a transformation makes capitals what they are there.
CLI::Validator oneOf(const std::vector<std::string>& choices);

/// Takes decimal digits and nothing else, and as a transformation removes leading zeroes: a driver
/// would read "x" as 0 and "010" as 8.
CLI::Validator numberUpTo(long largest);

}  // namespace cli
