// The sub-command `mrtu check`.
#include <fmt/format.h>

#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/TagNames.h"
#include "cli/check/CheckedTags.h"
#include "cli/check/DriverFacts.h"
#include "cli/check/FindingText.h"
#include "cli/describe/OfflineDriver.h"
#include "lint/LintConfig.h"
#include "lint/LintTags.h"
#include "lint/LintTimeouts.h"
#include "settings/FileReader.h"

namespace cli {
namespace {

using lint::Findings;
using lint::Severity;
using lint::TagLine;

struct Options {
    std::string configFile;
    std::string tagsFile;
    std::vector<std::string> words;
    std::string protocol = "MRTU";
    bool json = false;
    bool strict = false;
};

/// What came out of one run.
struct Report {
    Findings findings;
    std::size_t tags = 0;
    bool configAccepted = false;
};

void append(Findings& all, const Findings& more) {
    all.insert(all.end(), more.begin(), more.end());
}

void checkTags(IProtocol& protocol, const lint::TagSurroundings& surroundings,
               std::vector<TagLine>& tags, Findings& out) {
    for (TagLine& tag : tags) {
        std::string refusal = tag.orderRefusal;
        if (refusal.empty()) tag.facts = factsOf(protocol, tag.driverUri, refusal);
        if (!tag.facts) out.push_back(lint::tagRefusal(tag, surroundings, refusal));
        append(out, lint::lintTag(tag, surroundings));
    }
    append(out, lint::lintOverlaps(tags, surroundings.description));
    append(out, lint::lintList(tags, surroundings.description));
}

Report check(CommandContext& context, const Options& options) {
    const std::string text =
        settings::readText("configuration", options.configFile, {.bytes = settings::kConfigBytes});
    auto [tags, complaints] = checkedTags(context, options.tagsFile, options.words);
    const OfflineDriver driver(pluginFile(context), options.protocol);
    const settings::Description description = settings::parseDescription(driver.description());
    const settings::ScannedConfig config = settings::scanConfig(options.configFile, text);

    Report report;
    report.tags = tags.size();
    report.configAccepted = driver.protocol().Config(text.c_str()) != 0;
    append(report.findings, lint::lintConfig(config, description));
    append(report.findings, complaints);
    if (report.configAccepted) {
        checkTags(driver.protocol(), lint::surroundingsOf(text, description), tags,
                  report.findings);
        append(report.findings, lint::lintTimeouts(config, description, tags));
    } else {
        report.findings.push_back(
            lint::configRefusal(config, description, driver.protocol().GetLastErrorString()));
    }
    lint::sortByPlace(report.findings);
    return report;
}

std::string counted(int count, const char* word) {
    return fmt::format("{} {}{}", count, word, count == 1 ? "" : "s");
}

std::string summary(const Report& report) {
    std::string text = counted(lint::countOf(report.findings, Severity::Error), "error") + ", " +
                       counted(lint::countOf(report.findings, Severity::Warning), "warning");
    if (report.tags == 0) return text;
    const std::string tags = counted(static_cast<int>(report.tags), "tag");
    return text + (report.configAccepted
                       ? fmt::format(" ({} checked)", tags)
                       : fmt::format(" ({} not checked: the configuration is refused)", tags));
}

void print(const Report& report, bool json, std::ostream& out) {
    if (!json) {
        out << findingsText(report.findings) << summary(report) << '\n';
        return;
    }
    out << reportDocument(report.findings, report.configAccepted ? report.tags : 0);
}

constexpr const char* kFooter = R"(
Examples:
  mrtu check --config line.cfg --tags tags.csv
  mrtu check --config line.cfg --strict '1?HREG?400001?unsignedShort'

A list of tags is CSV with names and URIs, or has one URI a line. Without names the whole list is
checked. No port is opened.
Exit codes: 0 no errors, 1 warnings with --strict, 2 errors.)";

}  // namespace

CommandSpec checkCommand(CommandContext& context) {
    const auto options = std::make_shared<Options>();
    CommandSpec command{.name = "check",
                        .summary = "Check a configuration and tags without touching a port",
                        .footer = kFooter};
    command.options = {
        {.names = "--config",
         .target = &options->configFile,
         .help = "The configuration's file",
         .valueName = "FILE",
         .required = true},
        {.names = "uri",
         .target = &options->words,
         .help = "Tags to check; with --tags also names of the list"},
        {.names = "--json", .target = &options->json, .help = "Print JSON"},
        {.names = "--strict", .target = &options->strict, .help = "Warnings make the exit code 1"},
        {.names = "--protocol",
         .target = &options->protocol,
         .help = "The protocol's name in the plug-in",
         .valueName = "NAME",
         .group = "Driver",
         .showsDefault = true},
    };
    addTagsOption(command, options->tagsFile);
    addPluginOption(command, context);
    command.action = [options, &context] {
        const Report report = check(context, *options);
        print(report, options->json, context.out);
        context.exitCode = verdictOf(report.findings, options->strict);
    };
    return command;
}

}  // namespace cli
