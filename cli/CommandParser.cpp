// The only file that knows CLI11, which is large: whoever includes it compiles for ten seconds.
#include "cli/CommandParser.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <sstream>

#include "cli/Validators.h"

namespace cli {
namespace {

/// Gives CLI11 a target of whatever type.
struct AddOption {
    CLI::App& app;
    const OptionSpec& spec;

    // --help and --version are CLI11's own.
    CLI::Option* operator()(std::monostate) const { return nullptr; }
    CLI::Option* operator()(bool* target) const {
        return app.add_flag(spec.names, *target, spec.help);
    }
    template <class Value>
    CLI::Option* operator()(Value* target) const {
        return app.add_option(spec.names, *target, spec.help);
    }
};

CLI::Validator validatorOf(const WordCheck& check) {
    return {check, ""};
}

void addOption(CLI::App& app, const OptionSpec& spec) {
    CLI::Option& option = *std::visit(AddOption{app, spec}, spec.target);
    option.group(spec.group)->required(spec.required);
    if (!spec.valueName.empty()) option.type_name(spec.valueName);
    if (spec.check) option.transform(validatorOf(spec.check));
    if (!spec.choices.empty()) option.transform(validatorOf(oneOf(spec.choices)));
    if (spec.range) option.check(CLI::Range(spec.range->smallest, spec.range->largest));
    if (spec.oneWordEach) option.allow_extra_args(false);
    if (spec.showsDefault) option.capture_default_str();
    for (const std::string& other : spec.excludes)
        option.excludes(other);
}

/// What CLI11 must know before the first command below is added, which takes it over.
void describe(CLI::App& app, const CommandSpec& spec) {
    if (!spec.footer.empty()) app.footer(spec.footer);
    if (!spec.commands.empty()) app.require_subcommand(spec.needsCommand ? 1 : 0, 1);
    for (const OptionSpec& option : spec.allOptions()) {
        if (option.names == "--version")
            app.set_version_flag(option.names, spec.version, option.help);
        else if (std::holds_alternative<std::monostate>(option.target))
            app.set_help_flag(option.names, option.help);
        else
            addOption(app, option);
    }
    for (const CommandSpec& command : spec.commands)
        describe(*app.add_subcommand(command.name, command.summary), command);
}

/// @return the named commands from the program down to `last`.
CommandPath pathTo(const CLI::App& last, const CommandSpec& program) {
    std::vector<std::string> names;
    for (const CLI::App* each = &last; each->get_parent() != nullptr; each = each->get_parent())
        names.insert(names.begin(), each->get_name());
    CommandPath path{&program};
    for (const std::string& name : names) {
        const auto& commands = path.back()->commands;
        path.push_back(&*std::find_if(commands.begin(), commands.end(),
                                      [&](const CommandSpec& each) { return each.name == name; }));
    }
    return path;
}

const CLI::App& innermost(const CLI::App& app) {
    const CLI::App* command = &app;
    while (!command->get_subcommands().empty())
        command = command->get_subcommands().front();
    return *command;
}

/// @return the command whose words hold one that nobody took, else the innermost one.
const CLI::App& commandAtFault(const CLI::App& app) {
    const CLI::App* command = &app;
    while (command->remaining().empty() && !command->get_subcommands().empty())
        command = command->get_subcommands().front();
    return *command;
}

Refused refusalOf(const CLI::App& app, const CLI::ParseError& error, const CommandSpec& program) {
    const CLI::App& command = commandAtFault(app);
    const std::vector<std::string> stray = command.remaining();
    Refused refused{.path = pathTo(command, program),
                    .commandNamed = !command.get_subcommands().empty(),
                    .strayWord = {},
                    .reason = error.what()};
    if (!stray.empty()) refused.strayWord = stray.front();
    return refused;
}

Answered answerOf(const CLI::App& app, const CLI::ParseError& question) {
    std::ostringstream text;
    app.exit(question, text, text);
    return {text.str()};
}

}  // namespace

ParsedLine parseCommandLine(const CommandSpec& program, std::vector<std::string> words) {
    CLI::App app(program.summary, program.name);
    describe(app, program);
    // CLI11 takes them from the end.
    std::reverse(words.begin(), words.end());
    try {
        app.parse(std::move(words));
        return Accepted{pathTo(innermost(app), program)};
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() == 0) return answerOf(app, error);
        return refusalOf(app, error, program);
    }
}

}  // namespace cli
