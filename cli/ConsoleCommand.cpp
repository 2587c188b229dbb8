#include <fmt/format.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/LineEditor.h"
#include "cli/Session.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(With a COMMAND the driver's console is asked once and its answer printed as it is; an unknown
command ends with exit code 2. Without one, commands are taken line by line, from a terminal with
editing and history; "quit" or the end of the input ends the session. Without --port and --sim the
driver stays stopped: commands that need no line still answer. Answers are cut at 16 KiB.

Examples:
  mrtu console help
  mrtu console --sim read '1?HREG?400001?int'
  mrtu console --port /dev/ttyUSB0 setid 5 7
  mrtu console --sim)";

constexpr int kAnswerLimit = 16 * 1024;

struct ConsoleOptions {
    LineOptions line;
    std::vector<std::string> words;
};

std::string joined(const std::vector<std::string>& words) {
    std::string line;
    for (const std::string& word : words)
        line += (line.empty() ? "" : " ") + word;
    return line;
}

/// @param ownLine  The answer is to end its line also where the driver did not.
/// @return false for an unknown command.
bool ask(CommandContext& context, runtime::Channel& channel, const std::string& line,
         bool ownLine) {
    const auto answer = channel.command(line, kAnswerLimit);
    if (!answer) {
        complain(context, fmt::format("unknown command '{}'", line));
        return false;
    }
    context.out << *answer;
    if (ownLine && !answer->empty() && !answer->ends_with('\n')) context.out << '\n';
    context.out.flush();
    return true;
}

void askAll(CommandContext& context, runtime::Channel& channel) {
    const auto lines = openStandardInput("mrtu> ");
    FirstFailure first;
    while (const auto line = lines->next()) {
        if (line->empty()) continue;
        if (*line == "quit" || *line == "exit") break;
        if (!ask(context, channel, *line, true)) first.note(ExitCode::Usage);
    }
    // A person has seen the complaint; a script needs it at the end.
    if (!lines->interactive()) context.exitCode = first.code();
}

void console(CommandContext& context, const ConsoleOptions& options) {
    Session session(context, options.line);
    if (session.hasLine()) session.start();
    if (options.words.empty()) {
        askAll(context, session.channel());
    } else if (!ask(context, session.channel(), joined(options.words),
                    isatty(STDOUT_FILENO) == 1)) {
        context.exitCode = ExitCode::Usage;
    }
    session.checkStorage();
}

}  // namespace

void addConsoleCommand(CLI::App& app, CommandContext& context) {
    const auto options = std::make_shared<ConsoleOptions>();
    CLI::App* const command = app.add_subcommand("console", "Talk to the driver's text console");
    addLineOptions(*command, options->line, context);
    command->add_option("COMMAND", options->words, "A console command and its words");
    command->footer(kFooter);
    command->callback([options, &context] { console(context, *options); });
}

}  // namespace cli
