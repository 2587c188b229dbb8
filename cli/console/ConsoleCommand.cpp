// The sub-command `mrtu console`.
#include <fmt/format.h>
#include <unistd.h>

#include <memory>
#include <ostream>
#include <sstream>

#include "cli/Choices.h"
#include "cli/Commands.h"
#include "cli/Session.h"
#include "cli/UsageErrors.h"
#include "cli/console/LineEditor.h"
#include "cli/override/OverrideNotice.h"
#include "values/ByteOrder.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(With a COMMAND the driver's console is asked once and its answer printed as it is; an unknown
command ends with exit code 2, a failed read or write with that of its failure. Without one, commands are taken line by line, from a terminal with
editing and history; "quit" or the end of the input ends the session. Without --port and --sim the
driver stays stopped: commands that need no line still answer. Answers are cut at 16 KiB.

Examples:
  mrtu console help
  mrtu console --sim read '1?HREG?400001?int@ABCD'
  mrtu console --port /dev/ttyUSB0 setid 5 7
  mrtu console --sim)";

constexpr int kAnswerLimit = 16 * 1024;
constexpr int kGeneralError = -1;

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

/// The driver's console takes URIs without byte orders.
std::string withoutByteOrders(const std::string& line) {
    std::istringstream in(line);
    std::string command;
    std::string uri;
    in >> command >> uri;
    const bool takesUri = command == "read" || command == "write";
    if (!takesUri || uri.find('@') == std::string::npos) return line;
    std::string rest;
    std::getline(in, rest);
    return command + ' ' + values::withoutByteOrder(uri) + rest;
}

bool isHexLine(std::string_view answer) {
    constexpr std::string_view kHex = "0123456789abcdef\n";
    return !answer.empty() && answer.find_first_not_of(kHex) == std::string_view::npos;
}

/// The console answers failures like successes, with a text.
ExitCode verdictOn(const std::string& command, const std::string& answer, Session& session) {
    if (command == "setid") return answer == "invalid format\n" ? ExitCode::Usage : ExitCode::Done;
    if (command != "read" && command != "write") return ExitCode::Done;
    if (command == "read" ? isHexLine(answer) : answer == "written ok\n") return ExitCode::Done;
    if (session.portGone()) return ExitCode::Port;
    // What the driver says of itself is no error of its protocol's: "error: incorrect hex data".
    const runtime::ChannelError error = session.channel().lastError();
    if (answer != error.text || error.code == kGeneralError || !session.hasLine())
        return ExitCode::Usage;
    return exitCodeOf(error.code);
}

/// @return the commands that the driver's own help begins its lines with.
std::vector<std::string> commandsOf(runtime::Channel& channel) {
    std::istringstream lines(channel.command("help", kAnswerLimit).value_or(""));
    std::vector<std::string> names;
    for (std::string line; std::getline(lines, line);)
        names.push_back(line.substr(0, line.find(' ')));
    return names;
}

/// @param ownLine  The answer is to end its line also where the driver did not.
/// @return what became of the command.
ExitCode ask(CommandContext& context, Session& session, const std::string& line, bool ownLine) {
    const auto answer = session.channel().command(withoutByteOrders(line), kAnswerLimit);
    const std::string command = line.substr(0, line.find(' '));
    if (!answer) {
        complain(context, fmt::format("unknown command '{}'{}", line,
                                      didYouMean(command, commandsOf(session.channel()))));
        return ExitCode::Usage;
    }
    context.out << *answer;
    if (ownLine && !answer->empty() && !answer->ends_with('\n')) context.out << '\n';
    context.out.flush();
    return verdictOn(command, *answer, session);
}

/// A wrong byte order ends one command, not the session.
ExitCode askOrComplain(CommandContext& context, Session& session, const std::string& line,
                       bool ownLine) {
    try {
        return withUsageErrors([&] { return ask(context, session, line, ownLine); });
    } catch (const CommandError& error) {
        complain(context, error.what());
        return error.code();
    }
}

void askAll(CommandContext& context, Session& session) {
    const auto lines = openStandardInput("mrtu> ");
    FirstFailure first;
    while (const auto line = lines->next()) {
        if (line->empty()) continue;
        if (*line == "quit" || *line == "exit") break;
        first.note(askOrComplain(context, session, *line, true));
    }
    // A person has seen the complaint; a script needs it at the end.
    if (!lines->interactive()) context.exitCode = first.code();
}

void console(CommandContext& context, const ConsoleOptions& options) {
    Session session(context, options.line);
    if (session.hasLine()) {
        announceOverrides(context, session, options.line);
        session.start();
    }
    if (options.words.empty()) {
        askAll(context, session);
    } else {
        const bool atTerminal = isatty(STDOUT_FILENO) == 1;
        context.exitCode = askOrComplain(context, session, joined(options.words), atTerminal);
    }
    session.checkStorage();
}

}  // namespace

CommandSpec consoleCommand(CommandContext& context) {
    const auto options = std::make_shared<ConsoleOptions>();
    CommandSpec command{
        .name = "console", .summary = "Talk to the driver's text console", .footer = kFooter};
    addLineOptions(command, options->line, context);
    command.options.push_back(
        {.names = "COMMAND", .target = &options->words, .help = "A console command and its words"});
    command.action = [options, &context] { console(context, *options); };
    return command;
}

}  // namespace cli
