// Checks of the words behind options, each of which says what is accepted.
#pragma once

#include <string>
#include <vector>

#include "cli/CommandSpec.h"

namespace cli {

/// Refuses an empty word, which would pass for none.
WordCheck notEmpty();

/// Takes the choices, and makes capitals what they are there.
WordCheck oneOf(const std::vector<std::string>& choices);

/// Takes decimal digits and nothing else, and removes leading zeroes: a driver would read "x" as 0
/// and "010" as 8.
WordCheck numberUpTo(long largest);

}  // namespace cli
