// From the parser's declarations to data.
#include <CLI/CLI.hpp>
#include <sstream>

#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

std::vector<std::string> split(const std::string& text, char delimiter) {
    std::vector<std::string> pieces;
    std::istringstream stream(text);
    for (std::string piece; std::getline(stream, piece, delimiter);)
        pieces.push_back(piece);
    return pieces;
}

/// The choices in a type's text, "TEXT:{a,b}", or in a help text, "Same as --set parity=none|even".
std::vector<std::string> choicesOf(const std::string& type, const std::string& help) {
    const std::size_t open = type.find('{');
    const std::size_t close = type.find('}', open);
    if (close != std::string::npos) return split(type.substr(open + 1, close - open - 1), ',');
    const std::size_t bar = help.find('|');
    if (bar == std::string::npos) return {};
    const std::size_t start = help.find_last_of("= ", bar) + 1;
    return split(help.substr(start, help.find_first_of(" ,.()", bar) - start), '|');
}

/// "MS:INT in [0 - 1000]" is the value's name and what a check says of it.
std::string valueName(const std::string& type) {
    const std::string name = type.substr(0, type.find(':'));
    return name.empty() ? "VALUE" : name;
}

Option describeOption(const CLI::Option& option) {
    Option result;
    for (const std::string& name : option.get_snames())
        result.names.push_back('-' + name);
    for (const std::string& name : option.get_lnames())
        result.names.push_back("--" + name);
    const bool positional = result.names.empty();
    if (positional) result.names.push_back(option.get_name(true));
    result.help = option.get_description();
    result.group = option.get_group();
    if (option.get_type_size() != 0 && option.get_expected_max() != 0) {
        const std::string type = option.get_type_name();
        result.choices = choicesOf(type, result.help);
        result.value = positional ? result.names.front() : valueName(type);
    }
    result.required = option.get_required();
    result.repeated = option.get_items_expected_max() > 1;
    return result;
}

bool isTitle(const std::string& line) {
    return line.size() > 1 && line.front() != ' ' && line.back() == ':';
}

std::vector<Section> sectionsOf(const std::string& footer) {
    std::vector<Section> sections;
    for (const std::string& line : split(footer, '\n')) {
        if (isTitle(line)) {
            sections.push_back({line.substr(0, line.size() - 1), {}});
        } else {
            if (sections.empty()) sections.emplace_back();
            sections.back().lines.push_back(line);
        }
    }
    return sections;
}

void addOptions(Command& command, const CLI::App& app) {
    for (const CLI::Option* option : app.get_options()) {
        if (option->get_group().empty()) continue;
        auto& list = option->nonpositional() ? command.options : command.positionals;
        list.push_back(describeOption(*option));
    }
}

/// The parser hands the text under the options down to commands that have none of their own.
std::string ownFooter(const CLI::App& app) {
    const CLI::App* const parent = app.get_parent();
    const bool handedDown = parent != nullptr && parent->get_footer() == app.get_footer();
    return handedDown ? "" : app.get_footer();
}

Command describeCommand(const CLI::App& app, std::vector<std::string> words) {
    words.push_back(app.get_name());
    Command command{.words = std::move(words),
                    .summary = app.get_description(),
                    .options = {},
                    .positionals = {},
                    .commands = {},
                    .sections = sectionsOf(ownFooter(app))};
    addOptions(command, app);
    for (const CLI::App* each : app.get_subcommands([](const CLI::App*) { return true; })) {
        // A group of options is a command without a name there.
        if (each->get_name().empty())
            addOptions(command, *each);
        else if (!each->get_group().empty())
            command.commands.push_back(describeCommand(*each, command.words));
    }
    return command;
}

}  // namespace

Command describe(const CLI::App& program) {
    return describeCommand(program, {});
}

}  // namespace cli::manual
