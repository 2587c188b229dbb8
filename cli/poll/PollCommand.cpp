// The sub-command `mrtu poll`.
#include <unistd.h>

#include <algorithm>
#include <iostream>
#include <limits>
#include <memory>

#include "cli/Commands.h"
#include "cli/TagNames.h"
#include "cli/override/OverrideNotice.h"
#include "cli/poll/PollOutputs.h"
#include "cli/poll/PolledLine.h"
#include "cli/poll/StateText.h"

namespace cli {
namespace {

using std::chrono::milliseconds;

constexpr const char* kFooter =
    R"(On a terminal: a live table; q ends it, / filters, arrows and PgUp/PgDn scroll. Otherwise a line for
each change, CSV or with --json one JSON object; with --count and --once for each read.
Ctrl-C, SIGTERM and the end of --duration print the statistics. SIGHUP, or a change of the files,
has configuration and tags read again; files that are wrong leave the old ones in force.

Examples:
  mrtu poll --sim --tags tags.csv
  mrtu poll --config line.cfg --port /dev/ttyUSB0 --tags tags.csv --interval 250
  mrtu poll --sim --tags tags.csv --json --duration 60 > minute.ndjson
  mrtu poll --port /dev/ttyUSB0 --tags tags.csv --once && echo all good)";

struct Options {
    PollOptions poll;
    int count = 0;
    int durationS = 0;
    bool once = false;
    bool json = false;
    bool csv = false;

    [[nodiscard]] int cycles() const { return once ? 1 : count; }
};

constexpr int kLongestIntervalMs = 24 * 3600 * 1000;
constexpr milliseconds kScreenPause{200};
constexpr milliseconds kShortestPause{10};
constexpr milliseconds kLongestPause{100};

bool showsTable(const CommandContext& context, const Options& options) {
    const LineOptions& line = options.poll.line;
    const bool traced = line.trace || line.traceHex || line.traceMeaning;
    return !options.json && !options.csv && options.cycles() == 0 &&
           context.out.rdbuf() == std::cout.rdbuf() && atTerminal() &&
           !(traced && isatty(STDERR_FILENO) == 1);
}

PollLimits limitsOf(const Options& options, const PolledLine& line, bool table) {
    PollLimits limits{.cycles = static_cast<std::uint64_t>(options.cycles())};
    if (options.durationS > 0) limits.duration = std::chrono::seconds(options.durationS);
    limits.pause =
        table ? kScreenPause : std::clamp(line.shortestPeriod() / 2, kShortestPause, kLongestPause);
    // A look at very many tags must not be all that is done.
    limits.pause = std::max(limits.pause, milliseconds(line.tags().size() / 1000));
    return limits;
}

/// Runs until its end and closes the port; signals end the process at once from the end on.
ExitCode runWith(PollOutput& output, PolledLine& line, poll::Clock& clock, const PollLimits& limits,
                 bool keys) {
    const auto events = takeEvents(keys);
    line.start();
    return runPoll(line, output, *events, clock, limits);
}

void showTable(CommandContext& context, NoticeBoard& board, PolledLine& line, poll::Clock& clock,
               const Options& options) {
    board.hold(isatty(STDERR_FILENO) == 1);
    {
        TableOutput table(board, terminalAbilities());
        context.exitCode = runWith(table, line, clock, limitsOf(options, line, true), true);
    }
    board.hold(false);
    context.out << statisticsText(line.snapshot()) << std::flush;
    line.stop();
}

void writeRecords(CommandContext& context, NoticeBoard& board, PolledLine& line, poll::Clock& clock,
                  const Options& options) {
    std::ostream& out = context.liveOut == nullptr ? context.out : *context.liveOut;
    context.wroteLive = context.liveOut != nullptr;
    RecordOutput records(out, board, options.json ? RecordForm::Json : RecordForm::Csv,
                         options.cycles() > 0 ? RecordWhen::Read : RecordWhen::Change);
    context.exitCode = runWith(records, line, clock, limitsOf(options, line, false), false);
    if (!options.once) context.err << statisticsText(line.snapshot()) << std::flush;
    line.stop();
    // Nobody reads any more, which is how `head` works.
    if (records.readerGone()) out.clear();
}

void pollTags(CommandContext& context, const Options& options) {
    NoticeBoard board(context.err);
    poll::SystemClock clock;
    PolledLine line(context, board, clock, options.poll);
    announceOverrides(context, line.session(), options.poll.line);
    if (showsTable(context, options)) {
        showTable(context, board, line, clock, options);
    } else {
        writeRecords(context, board, line, clock, options);
    }
}

void addPollOptions(CommandSpec& command, Options& options) {
    addTagsOption(command, options.poll.tagsFile);
    command.options.back().required = true;
    constexpr int most = std::numeric_limits<int>::max();
    const std::vector<OptionSpec> more{
        {.names = "--interval",
         .target = &options.poll.intervalMs,
         .help = "Period of tags that have none of their own",
         .valueName = "MS",
         .range = NumberRange{1, kLongestIntervalMs},
         .showsDefault = true},
        {.names = "--count",
         .target = &options.count,
         .help = "End after N cycles, with the exit code of `read`",
         .valueName = "N",
         .range = NumberRange{1, most}},
        {.names = "--once",
         .target = &options.once,
         .help = "Same as --count 1, without statistics",
         .excludes = {"--count"}},
        {.names = "--duration",
         .target = &options.durationS,
         .help = "End after S seconds",
         .valueName = "S",
         .range = NumberRange{1, most}},
        {.names = "--json", .target = &options.json, .help = "Print one JSON object a line"},
        {.names = "--csv",
         .target = &options.csv,
         .help = "Print CSV, also on a terminal",
         .excludes = {"--json"}},
    };
    command.options.insert(command.options.end(), more.begin(), more.end());
}

}  // namespace

CommandSpec pollCommand(CommandContext& context) {
    const auto options = std::make_shared<Options>();
    CommandSpec command{
        .name = "poll", .summary = "Read a list of tags again and again", .footer = kFooter};
    addLineOptions(command, options->poll.line, context);
    addPollOptions(command, *options);
    command.action = [options, &context] { pollTags(context, *options); };
    return command;
}

}  // namespace cli
