// The complaint about a command line, with what was probably meant.
#include "cli/UsageText.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "cli/Choices.h"

namespace cli {
namespace {

std::vector<std::string> optionNames(const CommandSpec& command) {
    std::vector<std::string> names;
    for (const OptionSpec& option : command.allOptions())
        for (const std::string& name : option.nameList())
            if (name.starts_with("--")) names.push_back(name);
    return names;
}

std::vector<std::string> commandNames(const CommandSpec& command) {
    std::vector<std::string> names;
    for (const CommandSpec& each : command.commands)
        names.push_back(each.name);
    return names;
}

std::string unknownWord(const std::string& word, const Refused& line) {
    const CommandSpec& command = *line.path.back();
    if (word.starts_with('-')) {
        const std::string name = word.substr(0, word.find('='));
        const std::string meant = didYouMean(name, optionNames(command));
        return fmt::format("unknown option '{}'{}", name,
                           meant.empty() ? "; " + helpHint(line.path) : meant);
    }
    const std::vector<std::string> names = commandNames(command);
    if (names.empty() || line.commandNamed)
        return fmt::format("'{}' was not expected; {}", word, helpHint(line.path));
    return fmt::format("unknown command: {}", notOneOf(word, names));
}

}  // namespace

std::string helpHint(const CommandPath& path) {
    std::vector<std::string> words;
    for (const CommandSpec* each : path)
        words.push_back(each->name);
    return fmt::format("'{} --help' tells more", fmt::join(words, " "));
}

std::string usageText(const Refused& line) {
    // A misspelt word explains more than what is missing in its place.
    if (line.strayWord) return unknownWord(*line.strayWord, line);
    const std::vector<std::string> names = commandNames(*line.path.back());
    std::string text = !line.commandNamed && !names.empty()
                           ? fmt::format("one of {} must follow", fmt::join(names, ", "))
                           : line.reason;
    if (!text.ends_with('?')) text += "; " + helpHint(line.path);
    return text;
}

}  // namespace cli
