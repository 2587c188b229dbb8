// The whole command line: which sub-commands there are, and how a failure becomes an exit code.
#include <fmt/format.h>

#include <algorithm>
#include <ostream>
#include <sstream>
#include <string_view>

#include "cli/CommandParser.h"
#include "cli/Commands.h"
#include "cli/Results.h"
#include "cli/UsageErrors.h"
#include "cli/UsageText.h"

namespace cli {
namespace {

constexpr const char* kNoCommand = "what shall be done? mrtu --help lists the commands";

constexpr const char* kFooter = R"(Examples:
  mrtu read --sim '1?HREG?400001?unsignedShort' '1?OUTP?1?boolean-8'
  mrtu read --port /dev/ttyUSB0 --baud 9600 --parity even '1?HREG?400010?float@ABCD'
  mrtu write --port /dev/ttyUSB0 --verify '1?HREG?400001?short=-5'
  mrtu console --sim getmaxtm
  mrtu override set --port /dev/ttyUSB0 node 5=7 baud=38400
  mrtu plan --config line.cfg --tags tags.csv
  mrtu sim
  mrtu info
  mrtu COMMAND --help   (more examples)

Exit codes:
  0  all done
  1  anything that no other code names
  2  wrong usage, configuration, tag URI or value
  3  the serial port can't be opened, or is gone
  4  no response
  5  bad reply or exception
  128 + n  ended by signal n: 130 Ctrl-C, 143 SIGTERM, 129 SIGHUP
Of several failing URIs the first one's code counts.)";

/// @return the exit code of a command line that was taken.
ExitCode act(const Accepted& line, const CommandContext& context) {
    // CLI11's own demand comes before its complaint about a misspelt command.
    if (line.path.size() == 1) throw CommandError(ExitCode::Usage, kNoCommand);
    withUsageErrors([&] { line.path.back()->action(); });
    return context.exitCode;
}

ExitCode actOrAnswer(const ParsedLine& line, CommandContext& context) {
    if (const auto* const accepted = std::get_if<Accepted>(&line)) return act(*accepted, context);
    if (const auto* const answered = std::get_if<Answered>(&line)) {
        context.out << answered->text;
        return ExitCode::Done;
    }
    complain(context, usageText(std::get<Refused>(line)));
    return ExitCode::Usage;
}

}  // namespace

void complain(CommandContext& context, const std::string& text) {
    // What was said before on the other stream stays before when both go to one file.
    context.out.flush();
    context.complaints.push_back(text);
    context.err << "mrtu: " << text << '\n';
    context.err.flush();
}

CommandSpec commandLine(CommandContext& context) {
    return {.name = "mrtu",
            .summary =
                "Reads and writes tags of Modbus RTU and ASCII devices through a driver plug-in.",
            .footer = kFooter,
            .version = "mrtu " MRTU_VERSION,
            .commands = {readCommand(context), writeCommand(context), consoleCommand(context),
                         overrideCommand(context), infoCommand(context), describeCommand(context),
                         checkCommand(context), planCommand(context), pollCommand(context),
                         inspectCommand(context), simCommand(context)}};
}

namespace {

ExitCode runCommand(int argc, const char* const* argv, CommandContext& context) {
    const CommandSpec program = commandLine(context);
    try {
        return actOrAnswer(parseCommandLine(program, {argv + std::min(argc, 1), argv + argc}),
                           context);
    } catch (const CommandError& error) {
        complain(context, error.what());
        return error.code();
    } catch (const std::exception& error) {
        complain(context, error.what());
        return ExitCode::Other;
    }
}

bool wantsJson(int argc, const char* const* argv) {
    return std::any_of(argv, argv + argc,
                       [](const char* word) { return std::string_view(word) == "--json"; });
}

/// Nothing reaches `out` before the command's end: half a document would be none.
ExitCode runForJson(int argc, const char* const* argv, std::ostream& out, std::ostream& err) {
    std::ostringstream document;
    CommandContext context{
        .out = document, .err = err, .exitCode = ExitCode::Done, .pluginOption = {}};
    context.liveOut = &out;
    const ExitCode code = runCommand(argc, argv, context);
    if (context.wroteLive) return code;
    const std::string text = document.str();
    out << (text.empty() ? errorDocument(code, context.complaints) : text);
    return code;
}

}  // namespace

int runCommandLine(int argc, const char* const* argv, std::ostream& out, std::ostream& err) {
    CommandContext context{.out = out, .err = err, .exitCode = ExitCode::Done, .pluginOption = {}};
    ExitCode code =
        wantsJson(argc, argv) ? runForJson(argc, argv, out, err) : runCommand(argc, argv, context);
    out.flush();
    if (!out && code == ExitCode::Done) {
        complain(context, "the output can't be written");
        code = ExitCode::Other;
    }
    return static_cast<int>(code);
}

}  // namespace cli
