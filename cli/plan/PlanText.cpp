// The report on a plan for people.
#include <fmt/format.h>

#include <cmath>
#include <span>

#include "cli/describe/TextTable.h"
#include "cli/plan/PlanReport.h"
#include "poll/Reasons.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

using Rows = std::vector<std::vector<std::string>>;
using poll::millisecondsText;

std::string percentText(double load) {
    return fmt::format("{:.1f} %", load * 100);
}

std::string counted(std::size_t count, const char* word) {
    return fmt::format("{} {}{}", count, word, count == 1 ? "" : "s");
}

std::string namesText(const PlanReport& report, std::span<const std::size_t> tags) {
    std::string text;
    for (const std::size_t tag : tags)
        text += (text.empty() ? "" : ", ") + report.names[tag];
    return values::printableText(text);
}

/// A text that goes on below itself.
std::string indented(const std::string& text) {
    return textTable({{"   ", text}});
}

std::string lineText(const PlanReport& report) {
    const poll::CostModel& costs = report.costs;
    std::string text =
        fmt::format("{} baud, {}, {} bits a character; ", costs.rate.baud,
                    costs.mode == wire::Mode::Rtu ? "RTU" : "ASCII", costs.rate.characterBits);
    text += costs.gapAfterReply.count() == 0 ? "a reply ends by its length"
                                             : fmt::format("a reply ends by a silence of {}",
                                                           millisecondsText(costs.gapAfterReply));
    if (costs.turnaround.count() > 0)
        text += fmt::format("; a node answers after {}", millisecondsText(costs.turnaround));
    return text + "\n\n";
}

std::string placeText(const PlanReport::BlockLine& line) {
    const long last = line.address + std::max(line.block.items, 1L) - 1;
    return last == line.address
               ? fmt::format("node {} {} {}", line.block.node, line.block.area, line.address)
               : fmt::format("node {} {} {}..{}", line.block.node, line.block.area, line.address,
                             last);
}

std::string blockText(const PlanReport& report, std::size_t number) {
    const PlanReport::BlockLine& line = report.blocks[number];
    const poll::Block& block = line.block;
    const std::string requests =
        block.requests == 1 ? "" : fmt::format(" in {} requests", block.requests);
    return fmt::format("{}. {}, every {} ms: {}{}, {}, {}\n", number + 1, placeText(line),
                       block.period.count(), counted(line.characters, "character"), requests,
                       millisecondsText(block.cost), percentText(line.load)) +
           indented(namesText(report, block.tags)) + indented('(' + block.reason + ')');
}

std::string nodesText(const PlanReport& report) {
    Rows rows{{"NODE", "TAGS", "BLOCKS", "REQUESTS", "CHARACTERS", "ONCE", "LOAD"}};
    const auto add = [&rows](const std::string& name, std::size_t tags,
                             const poll::PlanSums& sums) {
        rows.push_back({name, std::to_string(tags), std::to_string(sums.blocks),
                        std::to_string(sums.requests), std::to_string(sums.characters),
                        millisecondsText(sums.once), percentText(sums.load)});
    };
    for (const PlanReport::NodeLine& node : report.nodes)
        add(std::to_string(node.node), node.tags, node.sums);
    if (report.nodes.size() > 1) add("all", report.names.size(), report.sums);
    return textTable(rows);
}

std::string rivalsText(const PlanReport& report) {
    Rows rows{{"PLAN", "REQUESTS", "CHARACTERS", "ONCE", "LOAD", "TO THIS PLAN"}};
    const auto add = [&](const std::string& name, const poll::PlanSums& sums) {
        const double ratio = report.sums.load > 0 ? sums.load / report.sums.load : 1;
        rows.push_back({name, std::to_string(sums.requests), std::to_string(sums.characters),
                        millisecondsText(sums.once), percentText(sums.load),
                        fmt::format("{:.2f}", ratio)});
    };
    add("this plan", report.sums);
    for (std::size_t at = 0; at < report.rivals.size(); ++at)
        add(report.rivals[at].name + (at == report.bestGap ? " (best gap)" : ""),
            report.rivals[at].sums);
    return textTable(rows);
}

std::string verdictText(const PlanReport& report) {
    const std::chrono::duration<double, std::milli> shortest = report.shortestPeriod;
    std::string text = fmt::format("one period for all tags can be {:.0f} ms at the shortest\n",
                                   std::ceil(shortest.count()));
    if (report.reachable())
        return text + fmt::format("the wanted periods take {} of the line's time\n",
                                  percentText(report.sums.load));
    text += fmt::format("the wanted periods can't be reached: they take {} of the line's time\n",
                        percentText(report.sums.load));
    if (report.sums.load > 1)
        text += fmt::format("periods {:.2f} times as long can\n", report.sums.load + 0.005);
    return text + "to blame:\n" + indented(namesText(report, report.blamed));
}

}  // namespace

std::string planText(const PlanReport& report) {
    std::string text = lineText(report);
    for (std::size_t number = 0; number < report.blocks.size(); ++number)
        text += blockText(report, number);
    return text + '\n' + nodesText(report) + '\n' + rivalsText(report) + '\n' + verdictText(report);
}

}  // namespace cli
