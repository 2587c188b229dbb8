// Command lines against the description of what they may hold.
#pragma once

#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "cli/CommandSpec.h"

namespace cli {

/// The program and the commands that were named below it, outermost first.
using CommandPath = std::vector<const CommandSpec*>;

/// The line was taken, and all targets hold what it says.
struct Accepted {
    CommandPath path;
};

/// The line asked for help or the version.
struct Answered {
    std::string text;  ///< Whole lines.
};

struct Refused {
    CommandPath path;                      ///< Down to the command at fault.
    bool commandNamed = false;             ///< Whether the line names a command below that one.
    std::optional<std::string> strayWord;  ///< One that nobody took; none: something else is wrong.
    std::string reason;                    ///< The parser's own text.
};

using ParsedLine = std::variant<Accepted, Answered, Refused>;

/// Reads a command line into the targets of the program's options; runs no action.
/// @param words  The line without the program's name.
/// @return paths into `program`. What the targets hold after a refusal is not said.
ParsedLine parseCommandLine(const CommandSpec& program, std::vector<std::string> words);

}  // namespace cli
