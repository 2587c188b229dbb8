// The options of `mrtu sim` that make a line and its nodes as slow and as unreliable as real ones.
#pragma once

#include <string>
#include <vector>

#include "cli/CommandSpec.h"
#include "sim/SimulatorOptions.h"

namespace cli {

struct SimBehaviour {
    int baud = 0;  ///< 0: characters take no time.
    std::string parity{}, stopBits{}, bits{};
    std::vector<std::string> turnarounds{};
    bool noQueue = false;
    int seed = 1;
    std::vector<int> dead{};
    std::vector<std::string> away{};
    std::vector<std::string> refused{};
};

/// Declares the options. @param behaviour  Must live until the action has run.
void addSimBehaviour(CommandSpec& command, SimBehaviour& behaviour);

/// Makes the line and its nodes what the options say. What is said for one node counts more than
/// what is said for all.
/// Errors: CommandError (Usage) for a malformed text, a node that is not on the line, and a
/// character's parts without a baud rate.
void applySimBehaviour(const SimBehaviour& behaviour, sim::SimulatorOptions& line);

}  // namespace cli
