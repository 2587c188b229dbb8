// Pages for man(1), in the language of man(7).
#include <algorithm>
#include <cctype>

#include "cli/manual/Manual.h"

namespace cli::manual {
namespace {

/// Text of the page: neither a hyphen nor a control line by accident.
std::string escaped(const std::string& text) {
    std::string result;
    for (const char c : text) {
        switch (c) {
            case '\\':
                result += "\\e";
                break;
            case '-':
                result += "\\-";
                break;
            case '\'':
                result += "\\(aq";
                break;
            case '^':
                result += "\\(ha";
                break;
            case '~':
                result += "\\(ti";
                break;
            case '`':
                result += "\\(ga";
                break;
            default:
                result += c;
        }
    }
    if (result.starts_with('.')) result.insert(0, "\\&");
    return result;
}

std::string bold(const std::string& text) {
    return "\\fB" + escaped(text) + "\\fR";
}

std::string italic(const std::string& text) {
    return "\\fI" + escaped(text) + "\\fR";
}

std::string upperCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    return text;
}

std::string heading(const std::string& title) {
    return ".SH " + upperCase(title) + '\n';
}

/// Without its full stop: a name is no sentence.
std::string asName(std::string summary) {
    while (summary.ends_with('.'))
        summary.pop_back();
    if (!summary.empty())
        summary.front() =
            static_cast<char>(std::tolower(static_cast<unsigned char>(summary.front())));
    return summary;
}

std::string synopsis(const Command& command) {
    std::string line = bold(command.joined(" "));
    if (!command.options.empty()) line += " [" + italic("OPTION") + "]...";
    for (const Option& each : command.positionals) {
        const std::string name = italic(each.names.front()) + (each.repeated ? "..." : "");
        line += each.required ? ' ' + name : " [" + name + ']';
    }
    if (!command.commands.empty()) line += ' ' + italic("COMMAND");
    return line + '\n';
}

std::string optionEntry(const Option& option) {
    std::string names;
    for (const std::string& name : option.names)
        names += (names.empty() ? "" : ", ") + bold(name);
    if (option.takesValue() && option.names.front().starts_with('-'))
        names += ' ' + italic(option.value);
    std::string entry = ".TP\n" + names + '\n' + escaped(option.help) + '\n';
    if (!option.choices.empty() && option.help.find('|') == std::string::npos) {
        std::string list;
        for (const std::string& choice : option.choices)
            list += (list.empty() ? "" : ", ") + bold(choice);
        entry += "One of " + list + ".\n";
    }
    return entry;
}

/// Positionals, then the options group by group; "Options" is the group of those without one.
std::string optionSections(const Command& command, const char* level) {
    std::string text;
    std::vector<std::string> groups;
    for (const Option& option : command.options)
        if (std::find(groups.begin(), groups.end(), option.group) == groups.end())
            groups.push_back(option.group);
    for (const Option& each : command.positionals)
        text += optionEntry(each);
    for (const std::string& group : groups) {
        if (group != "Options") text += level + escaped(group) + '\n';
        for (const Option& option : command.options)
            if (option.group == group) text += optionEntry(option);
    }
    return text;
}

/// The lines of the help text as they stand there; an unindented one begins a paragraph.
std::string body(const Section& section) {
    std::string text;
    bool asTyped = false;
    for (const std::string& line : section.lines) {
        if (line.empty()) continue;
        const bool indented = line.starts_with(' ');
        if (indented != asTyped) text += indented ? ".PP\n.nf\n" : ".fi\n.PP\n";
        asTyped = indented;
        text += escaped(indented ? line.substr(2) : line) + '\n';
    }
    return text + (asTyped ? ".fi\n" : "");
}

bool isExitCodes(const Section& section) {
    return section.title == "Exit codes";
}

/// The titled parts of the help text, and what the program's exit codes mean, which stands there
/// once for all commands.
std::string sections(const Command& command, const Command& program) {
    std::string text;
    for (const Section& section : command.sections)
        if (!section.title.empty() && !isExitCodes(section))
            text += heading(section.title) + body(section);
    for (const Section& section : program.sections)
        if (isExitCodes(section)) text += heading("Exit status") + body(section);
    return text;
}

std::string description(const Command& command) {
    std::string text = escaped(command.summary) + '\n';
    for (const Section& section : command.sections)
        if (section.title.empty()) text += ".PP\n" + body(section);
    return text;
}

/// A command that has no page of its own.
std::string innerCommand(const Command& command) {
    std::string text = ".SS " + command.joined(" ") + '\n' + synopsis(command) + ".PP\n";
    text += description(command) + optionSections(command, ".PP\n");
    for (const Section& section : command.sections)
        if (!section.title.empty())
            text += ".PP\n" + escaped(section.title) + ":\n" + body(section);
    return text;
}

std::string listOfCommands(const Command& command) {
    std::string text = heading("Commands");
    for (const Command& each : command.commands)
        text += ".TP\n.BR " + escaped(each.joined("-")) + " (1)\n" + escaped(each.summary) + '\n';
    return text;
}

std::string seeAlso(const Command& command, const Command& program) {
    std::vector<const Command*> pages{&program};
    for (const Command& each : program.commands)
        pages.push_back(&each);
    std::string text;
    for (const Command* page : pages)
        if (page->words != command.words)
            text += (text.empty() ? ".BR " : " ,\n.BR ") + escaped(page->joined("-")) + " (1)";
    return heading("See also") + text + "\n.PP\nThe folder /usr/share/doc/" +
           escaped(program.words.front()) + " holds more on each subject.\n";
}

}  // namespace

std::string manPage(const Command& command, const Command& program, const std::string& version) {
    const std::string& name = program.words.front();
    const bool whole = command.words.size() == 1;
    std::string page = ".TH " + upperCase(command.joined("-")) + " 1 \"\" \"" + name + ' ' +
                       version + "\" \"User Commands\"\n";
    page += heading("Name") + escaped(command.joined("-")) + " \\- " +
            escaped(asName(command.summary)) + '\n';
    page += heading("Synopsis") + synopsis(command);
    page += heading("Description") + description(command);
    page += heading("Options") + optionSections(command, ".SS ");
    if (whole) {
        page += listOfCommands(command);
    } else if (!command.commands.empty()) {
        page += heading("Commands");
        for (const Command& each : command.commands)
            page += innerCommand(each);
    }
    return page + sections(command, program) + seeAlso(command, program);
}

}  // namespace cli::manual
