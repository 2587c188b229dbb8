// The complaint about a command line, with what was probably meant.
#include "cli/UsageText.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <CLI/CLI.hpp>

#include "cli/Choices.h"

namespace cli {
namespace {

/// @return the command whose words hold one that nobody took, else the innermost one.
const CLI::App& commandAtFault(const CLI::App& app) {
    const CLI::App* command = &app;
    while (command->remaining().empty() && !command->get_subcommands().empty())
        command = command->get_subcommands().front();
    return *command;
}

std::vector<std::string> optionNames(const CLI::App& command) {
    std::vector<std::string> names;
    for (const CLI::Option* const option : command.get_options()) {
        for (const std::string& name : option->get_lnames())
            names.push_back("--" + name);
    }
    return names;
}

std::vector<std::string> commandNames(const CLI::App& command) {
    std::vector<std::string> names;
    for (const CLI::App* const each : command.get_subcommands({}))
        names.push_back(each->get_name());
    return names;
}

std::string unknownWord(const CLI::App& command) {
    const std::string word = command.remaining().front();
    if (word.starts_with('-')) {
        const std::string name = word.substr(0, word.find('='));
        const std::string meant = didYouMean(name, optionNames(command));
        return fmt::format("unknown option '{}'{}", name,
                           meant.empty() ? "; " + helpHint(command) : meant);
    }
    const std::vector<std::string> names = commandNames(command);
    if (names.empty() || !command.get_subcommands().empty())
        return fmt::format("'{}' was not expected; {}", word, helpHint(command));
    return fmt::format("unknown command: {}", notOneOf(word, names));
}

}  // namespace

std::string helpHint(const CLI::App& command) {
    std::string words = command.get_name();
    for (const CLI::App* each = command.get_parent(); each != nullptr; each = each->get_parent())
        words = each->get_name() + ' ' + words;
    return fmt::format("'{} --help' tells more", words);
}

std::string usageText(const CLI::App& app, const CLI::ParseError& error) {
    const CLI::App& command = commandAtFault(app);
    // A misspelt word explains more than what is missing in its place.
    if (!command.remaining().empty()) return unknownWord(command);
    const std::vector<std::string> names = commandNames(command);
    const bool noneChosen = command.get_subcommands().empty();
    std::string text = noneChosen && !names.empty()
                           ? fmt::format("one of {} must follow", fmt::join(names, ", "))
                           : error.what();
    if (!text.ends_with('?')) text += "; " + helpHint(command);
    return text;
}

}  // namespace cli
