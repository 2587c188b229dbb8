// The command line as data: what man pages and completions are made of. It is taken from the same
// declarations as `--help`, so that none of them can tell something else.
#pragma once

#include <string>
#include <vector>

#include "cli/CommandSpec.h"

namespace cli::manual {

struct Option {
    std::vector<std::string> names;    ///< With their dashes; of a positional the one name as is.
    std::string value;                 ///< What stands for the value in --help; empty for a flag.
    std::vector<std::string> choices;  ///< The only values, where they can be listed.
    std::string help;
    std::string group;
    bool required = false;
    bool repeated = false;

    bool takesValue() const { return !value.empty(); }
    /// Whether the value is the name of a file or a device.
    bool takesFile() const;
};

/// A part of the text under the options. What is indented there stands line by line.
struct Section {
    std::string title;  ///< Empty for what stands in front of the first title.
    std::vector<std::string> lines;
};

struct Command {
    std::vector<std::string> words;  ///< "mrtu", "override", "set"
    std::string summary;
    std::vector<Option> options;
    std::vector<Option> positionals;
    std::vector<Command> commands;
    std::vector<Section> sections;

    /// The words with `separator` between them.
    std::string joined(const std::string& separator) const;
    /// The words behind the program's own with blanks between them: "override set".
    std::string path() const;
};

/// What the program's command line accepts.
Command describe(const CommandSpec& program);

/// The commands from `top` down, each in front of its own commands.
std::vector<const Command*> withSubcommands(const Command& top);

/// @return the texts of the page in section 1 that tells about `command` and the commands below it;
/// the program's own page names its commands only, since each has a page of its own.
std::string manPage(const Command& command, const Command& program, const std::string& version);

/// Scripts that complete the program's command line in a shell.
std::string bashCompletion(const Command& program);
std::string zshCompletion(const Command& program);
std::string fishCompletion(const Command& program);

/// `text` as one word that the shells take as it is.
std::string shellQuoted(const std::string& text);

}  // namespace cli::manual
