// The report on a plan as JSON.
#include <span>

#include "cli/plan/PlanReport.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

double inMs(std::chrono::nanoseconds time) {
    return std::chrono::duration<double, std::milli>(time).count();
}

Json namesJson(const PlanReport& report, std::span<const std::size_t> tags) {
    Json json = Json::array();
    for (const std::size_t tag : tags)
        json.push_back(report.names[tag]);
    return json;
}

Json blockJson(const PlanReport& report, const PlanReport::BlockLine& line) {
    const poll::Block& block = line.block;
    return {{"node", block.node},
            {"area", block.area},
            {"first", block.first},
            {"address", line.address},
            {"items", block.items},
            {"fillerItems", block.fillerItems},
            {"periodMs", block.period.count()},
            {"requests", block.requests},
            {"characters", line.characters},
            {"ms", inMs(block.cost)},
            {"load", line.load},
            {"tags", namesJson(report, block.tags)},
            {"reason", block.reason}};
}

Json sumsJson(const poll::PlanSums& sums) {
    return {{"blocks", sums.blocks},
            {"requests", sums.requests},
            {"characters", sums.characters},
            {"onceMs", inMs(sums.once)},
            {"load", sums.load}};
}

Json lineJson(const poll::CostModel& costs) {
    return {{"baud", costs.rate.baud},
            {"mode", costs.mode == wire::Mode::Rtu ? "RTU" : "ASCII"},
            {"characterBits", costs.rate.characterBits},
            {"gapMs", inMs(costs.gapAfterReply)},
            {"turnaroundMs", inMs(costs.turnaround)}};
}

Json nodesJson(const PlanReport& report) {
    Json json = Json::array();
    for (const PlanReport::NodeLine& node : report.nodes) {
        Json line{{"node", node.node}, {"tags", node.tags}};
        line.update(sumsJson(node.sums));
        json.push_back(line);
    }
    return json;
}

Json rivalsJson(const PlanReport& report) {
    Json json = Json::array();
    for (std::size_t at = 0; at < report.rivals.size(); ++at) {
        Json line{{"plan", report.rivals[at].name}, {"bestGap", at == report.bestGap}};
        line.update(sumsJson(report.rivals[at].sums));
        json.push_back(line);
    }
    return json;
}

}  // namespace

std::string planDocument(const PlanReport& report) {
    Json blocks = Json::array();
    for (const PlanReport::BlockLine& line : report.blocks)
        blocks.push_back(blockJson(report, line));
    const Json object{{"line", lineJson(report.costs)},
                      {"tags", report.names.size()},
                      {"blocks", blocks},
                      {"nodes", nodesJson(report)},
                      {"plan", sumsJson(report.sums)},
                      {"rivals", rivalsJson(report)},
                      {"shortestPeriodMs", inMs(report.shortestPeriod)},
                      {"reachable", report.reachable()},
                      {"toBlame", namesJson(report, report.blamed)}};
    // Names may be anything; what is not UTF-8 is shown as such.
    return object.dump(2, ' ', false, Json::error_handler_t::replace) + '\n';
}

}  // namespace cli
