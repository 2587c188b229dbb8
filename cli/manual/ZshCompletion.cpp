// A completion for zsh: one function a command, each a call of _arguments.
#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

/// Text inside an entry of _arguments.
std::string plain(const std::string& text, const std::string& special) {
    std::string result;
    for (const char c : text) {
        if (special.find(c) != std::string::npos) result += '\\';
        result += c;
    }
    return result;
}

std::string actionFor(const Option& option) {
    if (option.takesFile()) return "_files";
    if (option.choices.empty()) return " ";
    std::string words;
    for (const std::string& choice : option.choices)
        words += (words.empty() ? "" : " ") + plain(choice, "\\ :()");
    return '(' + words + ')';
}

std::string argumentOf(const Option& option) {
    return ':' + plain(option.value, "\\:") + ':' + actionFor(option);
}

/// One entry for each name of the option.
std::string entries(const Option& option) {
    std::string text;
    for (const std::string& name : option.names) {
        const std::string repeat = option.repeated ? "*" : "";
        const bool joins = option.takesValue() && name.starts_with("--");
        const std::string spec = repeat + name + (joins ? "=" : "") + '[' +
                                 plain(option.help, "\\[]:") + ']' +
                                 (option.takesValue() ? argumentOf(option) : "");
        text += " \\\n    " + shellQuoted(spec);
    }
    return text;
}

std::string functionOf(const Command& command) {
    return '_' + command.joined("_");
}

std::string choiceOfCommand(const Command& command) {
    std::string text = "  case $state in\n  command)\n    local -a commands=(\n";
    for (const Command& each : command.commands)
        text += "      " + shellQuoted(each.words.back() + ':' + plain(each.summary, "\\:")) + '\n';
    text += "    )\n    _describe command commands\n    ;;\n  arguments)\n    case $words[1] in\n";
    for (const Command& each : command.commands)
        text += "    " + each.words.back() + ") " + functionOf(each) + " ;;\n";
    return text + "    esac\n    ;;\n  esac\n";
}

std::string function(const Command& command) {
    std::string text = functionOf(command) + "() {\n";
    if (!command.commands.empty())
        text += "  local context state state_descr line\n  typeset -A opt_args\n";
    text += std::string("  _arguments") + (command.commands.empty() ? "" : " -C");
    for (const Option& option : command.options)
        text += entries(option);
    for (const Option& each : command.positionals)
        text += " \\\n    " + shellQuoted((each.repeated ? "*" : "") + argumentOf(each));
    if (!command.commands.empty()) text += " \\\n    '1: :->command' '*:: :->arguments'";
    text += '\n';
    if (!command.commands.empty()) text += choiceOfCommand(command);
    return text + "}\n\n";
}

}  // namespace

std::string zshCompletion(const Command& program) {
    const std::string& name = program.words.front();
    std::string text = "#compdef " + name + "\n# Completion of the command line of " + name +
                       " for zsh. Generated.\n\n";
    for (const Command* each : withSubcommands(program))
        text += function(*each);
    // Loaded as the function of that name the file must also do what the function does.
    return text + "if [ \"$funcstack[1]\" = _" + name + " ]; then\n  _" + name +
           " \"$@\"\nelse\n  compdef _" + name + ' ' + name + "\nfi\n";
}

}  // namespace cli::manual
