// The sub-command `mrtu plan`.
#include <fmt/format.h>

#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/ConfigWarnings.h"
#include "cli/LineOptions.h"
#include "cli/TagNames.h"
#include "cli/describe/OfflineDriver.h"
#include "cli/plan/PlanReport.h"
#include "poll/LineCosts.h"
#include "poll/TagPlacing.h"
#include "values/ByteOrder.h"
#include "values/TextEscapes.h"
#include "values/ValueError.h"

namespace cli {
namespace {

struct Options {
    LineOptions line;
    std::string tagsFile;
    std::vector<std::string> words;
    int intervalMs = 1000;
    int turnaroundMs = 0;
    bool json = false;
};

constexpr int kLongestMs = 24 * 60 * 60 * 1000;

std::string sourceOf(const Options& options, const poll::ListedTag& tag) {
    return tag.line > 0 ? fmt::format("{}:{}: ", options.tagsFile, tag.line) : std::string();
}

/// @return the place of a tag; nothing, after a complaint, when the driver refuses its URI.
std::optional<poll::TagPlace> placeOf(IProtocol& protocol, const poll::ListedTag& tag,
                                      const settings::Description& description,
                                      std::string& refusal) {
    try {
        ITag* const made = protocol.CreateTag(values::withoutByteOrder(tag.uri).c_str());
        if (made == nullptr) {
            refusal = protocol.GetLastErrorString();
            return std::nullopt;
        }
        auto place = poll::placeOf(*made, protocol, description);
        protocol.FreeTag(made);
        if (!place) refusal = "the driver does not tell where the tag is";
        return place;
    } catch (const values::ValueError& error) {
        refusal = fmt::format("{}: {}", tag.uri, error.what());
        return std::nullopt;
    }
}

void addPlaces(PlanTask& task, CommandContext& context, const Options& options, IProtocol& protocol,
               const std::vector<poll::ListedTag>& tags) {
    for (const poll::ListedTag& tag : tags) {
        std::string refusal;
        auto place = placeOf(protocol, tag, task.description, refusal);
        if (!place) {
            complain(context, values::printableText(sourceOf(options, tag) + refusal));
            continue;
        }
        place->period = tag.period.value_or(std::chrono::milliseconds{options.intervalMs});
        task.names.push_back(tag.name);
        task.places.push_back(*place);
    }
    if (task.places.size() != tags.size())
        throw CommandError(ExitCode::Usage, "no plan: not every tag can be made");
}

poll::LineHabits habitsOf(const Options& options) {
    return {.endsByLength = options.line.frameEnd == "length",
            .shortestGap = std::chrono::milliseconds{options.line.minGapMs},
            .turnaround = std::chrono::milliseconds{options.turnaroundMs}};
}

PlanTask taskOf(const Options& options, CommandContext& context) {
    const std::string text = configTextOf(options.line);
    const std::vector<poll::ListedTag> tags =
        TagNames(context, options.tagsFile).tags(options.words);
    if (tags.empty()) throw CommandError(ExitCode::Usage, "no tags: --tags FILE, or URIs");
    const OfflineDriver driver(pluginFile(context), options.line.protocol);
    warnOfUnknownKeys(context, driver.protocol(), text);
    if (driver.protocol().Config(text.c_str()) == 0)
        throw CommandError(ExitCode::Usage, fmt::format("configuration: {}",
                                                        driver.protocol().GetLastErrorString()));
    PlanTask task{.names = {},
                  .places = {},
                  .description = settings::parseDescription(driver.description()),
                  .config = settings::scanConfig("configuration", text),
                  .costs = {}};
    addPlaces(task, context, options, driver.protocol(), tags);
    task.costs =
        poll::costsOf(task.config, task.description, poll::nodesOf(task.places), habitsOf(options));
    return task;
}

constexpr const char* kFooter = R"(Examples:
  mrtu plan --config line.cfg --tags tags.csv
  mrtu plan --config line.cfg --tags tags.csv --baud 115200 --frame-end length
  mrtu plan --json --interval 200 '1?HREG?400001?float' '1?HREG?400020?short'

Tags that name no period have that of --interval. No port is opened.
Exit codes: 0 there is time for every tag at its period, 1 there is not, 2 wrong usage.)";

std::vector<OptionSpec> planOptions(Options& options) {
    return {{.names = "tag",
             .target = &options.words,
             .help = "Tags: names of the list, or URIs; none: the whole list"},
            {.names = "--json", .target = &options.json, .help = "Print JSON"},
            {.names = "--interval",
             .target = &options.intervalMs,
             .help = "Period in ms of the tags that name none",
             .valueName = "MS",
             .range = NumberRange{1, kLongestMs},
             .showsDefault = true}};
}

std::vector<OptionSpec> lineOptions(Options& options) {
    return {{.names = "--turnaround",
             .target = &options.turnaroundMs,
             .help = "Time in ms that a node is assumed to take until it answers; the least is the "
                     "silence that the mode demands",
             .valueName = "MS",
             .range = NumberRange{0, 60000},
             .showsDefault = true},
            {.names = "--min-gap",
             .target = &options.line.minGapMs,
             .help = "Shortest silence in ms that ends a reply, as for the other line commands",
             .valueName = "MS",
             .range = NumberRange{0, 1000}},
            {.names = "--frame-end",
             .target = &options.line.frameEnd,
             .help = "What ends a reply, as for the other line commands",
             .valueName = "BY",
             .choices = {"silence", "length"},
             .showsDefault = true}};
}

}  // namespace

CommandSpec planCommand(CommandContext& context) {
    const auto options = std::make_shared<Options>();
    CommandSpec command{.name = "plan",
                        .summary = "Show how a tag list is polled in the least time, and why",
                        .footer = kFooter};
    command.options = planOptions(*options);
    addTagsOption(command, options->tagsFile);
    command.addGroup("Line", lineOptions(*options));
    addConfigurationOptions(command, options->line);
    command.addGroup("Driver", {{.names = "--protocol",
                                 .target = &options->line.protocol,
                                 .help = "Protocol of the plug-in",
                                 .valueName = "NAME",
                                 .showsDefault = true}});
    addPluginOption(command, context);
    command.action = [options, &context] {
        const PlanReport report = reportOn(taskOf(*options, context));
        context.out << (options->json ? planDocument(report) : planText(report));
        if (!report.reachable()) context.exitCode = ExitCode::Other;
    };
    return command;
}

}  // namespace cli
