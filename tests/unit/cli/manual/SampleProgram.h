// A small program with one of everything that a command line can declare.
#pragma once

#include "cli/manual/Manual.h"

namespace manual_test {

cli::manual::Command sampleProgram();

/// @return the command with this path, e.g. "store set". REQUIRES: there is one.
const cli::manual::Command& commandOf(const cli::manual::Command& program, const std::string& path);

}  // namespace manual_test
