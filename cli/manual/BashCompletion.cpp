// A completion for bash that needs nothing but bash itself.
#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

constexpr const char* kHead = R"(# Completion of the command line of PROGRAM for bash. Generated.

_PROGRAM() {
    local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
    local command='' index words='' files=''
    # Readline makes a word of the sign in --option=value.
    if [[ $current == = ]]; then
        current=''
    elif [[ $previous == = ]]; then
        previous=${COMP_WORDS[COMP_CWORD - 2]}
    fi
    for ((index = 1; index < COMP_CWORD; ++index)); do
        case "$command ${COMP_WORDS[index]}" in
)";

constexpr const char* kTail = R"(    COMPREPLY=()
    if [[ $files ]]; then
        compopt -o filenames 2>/dev/null
        mapfile -t COMPREPLY < <(compgen -f -- "$current")
    else
        mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
    fi
}

complete -F _PROGRAM PROGRAM
)";

std::string withProgram(std::string text, const std::string& program) {
    constexpr std::string_view kName = "PROGRAM";
    for (std::size_t at = text.find(kName); at != std::string::npos;
         at = text.find(kName, at + program.size()))
        text.replace(at, kName.size(), program);
    return text;
}

/// `words` with blanks between them. No name of an option, a command or a choice needs quotes.
std::string list(const std::vector<std::string>& words) {
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : " ") + word;
    return text;
}

/// The branches that follow the words from command to command.
std::string branchesOfPath(const Command& command) {
    std::string text;
    for (const Command& each : command.commands) {
        text += "            " + shellQuoted(command.path() + ' ' + each.words.back()) +
                ") command=" + shellQuoted(each.path()) + " ;;\n";
        text += branchesOfPath(each);
    }
    return text;
}

std::string actionFor(const Option& option) {
    if (!option.choices.empty()) return "words='" + list(option.choices) + '\'';
    return option.takesFile() ? "files=1" : "words=";
}

/// The branches for the value of an option.
std::string branchesOfValues(const Command& command) {
    std::string text;
    for (const Option& option : command.options) {
        if (!option.takesValue()) continue;
        std::string patterns;
        for (const std::string& name : option.names)
            patterns += (patterns.empty() ? "" : " | ") + shellQuoted(command.path() + ' ' + name);
        text += "        " + patterns + ") " + actionFor(option) + " ;;\n";
    }
    return text;
}

/// What may stand at a place where no option waits for its value.
std::string branchOfWords(const Command& command) {
    std::vector<std::string> options;
    for (const Option& option : command.options)
        options.insert(options.end(), option.names.begin(), option.names.end());
    std::vector<std::string> others;
    bool files = false;
    for (const Command& each : command.commands)
        others.push_back(each.words.back());
    for (const Option& each : command.positionals) {
        others.insert(others.end(), each.choices.begin(), each.choices.end());
        files = files || (each.choices.empty() && each.takesFile());
    }
    const std::string argument = files ? "files=1" : "words='" + list(others) + '\'';
    return "                " + shellQuoted(command.path()) + ")\n" +
           "                    if [[ $current == -* ]]; then words='" + list(options) + "'\n" +
           "                    else " + argument + "; fi ;;\n";
}

}  // namespace

std::string bashCompletion(const Command& program) {
    std::string text = kHead + branchesOfPath(program) + "        esac\n    done\n";
    text += "    case \"$command $previous\" in\n";
    for (const Command* each : withSubcommands(program))
        text += branchesOfValues(*each);
    text += "        *)\n            case $command in\n";
    for (const Command* each : withSubcommands(program))
        text += branchOfWords(*each);
    text += "            esac\n            ;;\n    esac\n";
    return withProgram(text + kTail, program.words.front());
}

}  // namespace cli::manual
