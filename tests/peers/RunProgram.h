// Runs a program and collects what it says.
#pragma once

#include <string>
#include <vector>

namespace peers {

struct ProgramResult {
    int exitCode = -1;   ///< 127 when there is no such program; -1 when a signal ended it.
    std::string output;  ///< Standard output and standard error as they came.
};

/// Runs a program from the search path with its standard input empty, and waits for its end.
ProgramResult runProgram(const std::vector<std::string>& arguments);

}  // namespace peers
