// A completion for fish: one line for each option and command.
#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

/// Tells which command the words in front of the cursor have reached, e.g. "override set".
std::string pathFunction(const Command& program) {
    std::string text = "function __" + program.words.front() +
                       "_command\n    set -l path ''\n"
                       "    for word in (commandline -opc)[2..-1]\n"
                       "        switch \"$path $word\"\n";
    for (const Command* each : withSubcommands(program)) {
        for (const Command& next : each->commands)
            text += "            case " + shellQuoted(each->path() + ' ' + next.words.back()) +
                    "\n                set path " + shellQuoted(next.path()) + '\n';
    }
    return text + "        end\n    end\n    echo $path\nend\n\n";
}

std::string lineFor(const Command& command, const std::string& program) {
    return "complete -c " + program + " -n " +
           shellQuoted("test (__" + program + "_command) = \"" + command.path() + '"');
}

std::string valueOf(const Option& option) {
    if (!option.takesValue()) return "";
    if (option.takesFile()) return " -r -F";
    std::string words;
    for (const std::string& choice : option.choices)
        words += (words.empty() ? "" : " ") + choice;
    return words.empty() ? " -x" : " -x -a " + shellQuoted(words);
}

std::string nameOf(const std::string& name) {
    return name.starts_with("--") ? " -l " + name.substr(2) : " -s " + name.substr(1);
}

std::string linesOf(const Command& command, const std::string& program) {
    const std::string line = lineFor(command, program);
    std::string text;
    for (const Command& each : command.commands)
        text += line + " -a " + each.words.back() + " -d " + shellQuoted(each.summary) + '\n';
    for (const Option& option : command.options) {
        text += line;
        for (const std::string& name : option.names)
            text += nameOf(name);
        text += valueOf(option) + " -d " + shellQuoted(option.help) + '\n';
    }
    for (const Option& each : command.positionals)
        if (each.takesFile() || !each.choices.empty()) text += line + valueOf(each) + '\n';
    return text;
}

}  // namespace

std::string fishCompletion(const Command& program) {
    const std::string& name = program.words.front();
    std::string text = "# Completion of the command line of " + name + " for fish. Generated.\n\n" +
                       pathFunction(program) + "complete -c " + name + " -f\n";
    for (const Command* each : withSubcommands(program))
        text += linesOf(*each, name);
    return text;
}

}  // namespace cli::manual
