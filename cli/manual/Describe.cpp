// From the description of a command line to what its pages tell.
#include <sstream>

#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

Option describeOption(const OptionSpec& option) {
    return {.names = option.nameList(),
            .value = option.isPositional() ? option.names : option.shownValueName(),
            .choices = option.choices,
            .help = option.help,
            .group = option.group,
            .required = option.required,
            .repeated = option.isRepeated()};
}

bool isTitle(const std::string& line) {
    return line.size() > 1 && line.front() != ' ' && line.back() == ':';
}

std::vector<Section> sectionsOf(const std::string& footer) {
    std::vector<Section> sections;
    std::istringstream lines(footer);
    for (std::string line; std::getline(lines, line);) {
        if (isTitle(line)) {
            sections.push_back({line.substr(0, line.size() - 1), {}});
        } else {
            if (sections.empty()) sections.emplace_back();
            sections.back().lines.push_back(line);
        }
    }
    return sections;
}

Command describeCommand(const CommandSpec& spec, std::vector<std::string> words) {
    words.push_back(spec.name);
    Command command{.words = std::move(words),
                    .summary = spec.summary,
                    .options = {},
                    .positionals = {},
                    .commands = {},
                    .sections = sectionsOf(spec.footer)};
    for (const OptionSpec& option : spec.allOptions())
        (option.isPositional() ? command.positionals : command.options)
            .push_back(describeOption(option));
    for (const CommandSpec& each : spec.commands)
        command.commands.push_back(describeCommand(each, command.words));
    return command;
}

}  // namespace

Command describe(const CommandSpec& program) {
    return describeCommand(program, {});
}

}  // namespace cli::manual
