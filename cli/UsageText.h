// What a command line that was not accepted is answered with.
#pragma once

#include <string>

#include "cli/CommandParser.h"

namespace cli {

/// @return one line: the word that is unknown and the nearest known one, or what is missing, and
/// where to read on.
std::string usageText(const Refused& line);

/// @return "'mrtu override set --help' tells more". REQUIRES: `path` is not empty.
std::string helpHint(const CommandPath& path);

}  // namespace cli
