#include "cli/plan/PlanReport.h"

#include <fmt/format.h>

#include <algorithm>
#include <numeric>

#include "poll/TagPlacing.h"
#include "settings/ReadLimits.h"

namespace cli {
namespace {

using poll::Block;
using poll::Plan;
using std::chrono::nanoseconds;

double loadOf(const Block& block) {
    return std::chrono::duration<double>(block.cost) / std::chrono::duration<double>(block.period);
}

long addressOf(const Block& block, const PlanTask& task) {
    const settings::AreaInfo* const area = task.description.area(block.area);
    if (area == nullptr) return block.first;
    const auto* const model = settings::modelOf(task.description, task.config, block.node);
    return settings::offerOf(*area, model).min + block.first;
}

void addToNodes(std::vector<PlanReport::NodeLine>& nodes, const Block& block,
                std::size_t characters) {
    // Blocks come sorted by node.
    if (nodes.empty() || nodes.back().node != block.node) nodes.push_back({.node = block.node});
    PlanReport::NodeLine& node = nodes.back();
    node.tags += block.tags.size();
    ++node.sums.blocks;
    node.sums.requests += block.requests;
    node.sums.characters += characters;
    node.sums.once += block.cost;
    node.sums.load += loadOf(block);
}

/// The dearest blocks, as many as it takes for the others to find room, and those that take longer
/// than their period.
std::vector<std::size_t> blamedTags(const Plan& plan, const PlanTask& task) {
    std::vector<const Block*> dearest;
    for (const Block& block : plan.blocks)
        dearest.push_back(&block);
    std::stable_sort(dearest.begin(), dearest.end(), [](const Block* one, const Block* other) {
        return loadOf(*one) > loadOf(*other);
    });
    std::vector<std::size_t> blamed;
    double left = plan.load;
    for (const Block* block : dearest) {
        if (left <= 1 && loadOf(*block) <= 1) break;
        left -= loadOf(*block);
        for (const std::size_t tag : block->tags)
            if (task.places[tag].period == block->period) blamed.push_back(tag);
    }
    std::sort(blamed.begin(), blamed.end());
    return blamed;
}

nanoseconds shortestPeriod(const PlanTask& task, const poll::Limits& limits) {
    std::vector<poll::TagPlace> places = task.places;
    for (poll::TagPlace& place : places)
        place.period = std::chrono::seconds{1};
    return poll::sumsOf(poll::makePlan(places, limits, task.costs), limits, task.costs).once;
}

void addRivals(PlanReport& report, const PlanTask& task, const poll::Limits& limits) {
    const auto add = [&](const std::string& name, const Plan& plan) {
        report.rivals.push_back({name, poll::sumsOf(plan, limits, task.costs)});
    };
    add("one request a tag", poll::planOfSingles(task.places, limits, task.costs));
    for (const long gap : poll::kFixedGaps)
        add(fmt::format("fixed gap {}", gap),
            poll::planOfFixedGap(task.places, gap, limits, task.costs));
    const auto best = std::min_element(
        report.rivals.begin() + 1, report.rivals.end(),
        [](const auto& one, const auto& other) { return one.sums.load < other.sums.load; });
    report.bestGap = static_cast<std::size_t>(best - report.rivals.begin());
}

}  // namespace

PlanReport reportOn(const PlanTask& task) {
    const poll::Limits limits = poll::limitsOf(task.places, task.config, task.description);
    const Plan plan = poll::makePlan(task.places, limits, task.costs);
    PlanReport report;
    report.names = task.names;
    report.costs = task.costs;
    for (const Block& block : plan.blocks) {
        const std::size_t characters = poll::charactersOf(block, limits, task.costs);
        report.blocks.push_back({block, addressOf(block, task), characters, loadOf(block)});
        addToNodes(report.nodes, block, characters);
    }
    report.sums = poll::sumsOf(plan, limits, task.costs);
    addRivals(report, task, limits);
    report.shortestPeriod = shortestPeriod(task, limits);
    report.blamed = blamedTags(plan, task);
    return report;
}

}  // namespace cli
