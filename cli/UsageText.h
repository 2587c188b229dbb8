// What a command line that was not accepted is answered with.
#pragma once

#include <string>

namespace CLI {
class App;
class ParseError;
}  // namespace CLI

namespace cli {

/// @param app  The program, after app.parse() threw `error`.
/// @return one line: the word that is unknown and the nearest known one, or what is missing, and
/// where to read on.
std::string usageText(const CLI::App& app, const CLI::ParseError& error);

/// @return "'mrtu override set --help' tells more".
std::string helpHint(const CLI::App& command);

}  // namespace cli
