#include "poll/Rivals.h"

#include <algorithm>
#include <numeric>
#include <tuple>

#include "poll/Draft.h"

namespace poll {
namespace {

int itemBytesOf(const TagPlace& place) {
    return place.bits ? 0 : place.itemBytes;
}

AreaRules rulesOf(const TagPlace& place, const Limits& limits, const CostModel& costs) {
    AreaRules rules{.limits = limits.of(place.node, place.area, itemBytesOf(place)),
                    .cost = costs.readCost(place.node, itemBytesOf(place))};
    rules.limits.mostItems = std::max(rules.limits.mostItems, 1L);
    return rules;
}

auto groupOf(const TagPlace& place) {
    return std::tie(place.node, place.area, place.bits, place.itemBytes, place.period);
}

Block blockOf(const TagPlace& place, std::size_t index) {
    Block block;
    block.node = place.node;
    block.area = place.area;
    block.bits = place.bits;
    block.itemBytes = place.itemBytes;
    block.first = place.first;
    block.items = place.items;
    block.tags = {index};
    block.period = place.period;
    return block;
}

void finish(Plan& plan, Block& block, const AreaRules& rules) {
    const Extent extent{block.first, block.first + block.items};
    block.cost = rules.costOf(extent);
    block.requests = static_cast<int>(rules.requestsOf(extent));
    plan.load += rules.loadOf(extent, block.period);
    plan.blocks.push_back(std::move(block));
}

std::vector<std::size_t> inGroups(std::span<const TagPlace> places) {
    std::vector<std::size_t> order(places.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::sort(order.begin(), order.end(), [&](std::size_t one, std::size_t other) {
        if (groupOf(places[one]) != groupOf(places[other]))
            return groupOf(places[one]) < groupOf(places[other]);
        return places[one].first < places[other].first;
    });
    return order;
}

}  // namespace

std::size_t charactersOf(const Block& block, const Limits& limits, const CostModel& costs) {
    if (block.requests == 0) return 0;
    const int itemBytes = block.bits ? 0 : block.itemBytes;
    const long most = std::max(limits.of(block.node, block.area, itemBytes).mostItems, 1L);
    const long full = block.requests - 1;
    const long rest = std::max(block.items - full * most, 0L);
    return static_cast<std::size_t>(full) *
               (full == 0 ? 0 : costs.readCharacters(most, itemBytes)) +
           costs.readCharacters(rest, itemBytes);
}

PlanSums sumsOf(const Plan& plan, const Limits& limits, const CostModel& costs) {
    PlanSums sums;
    sums.blocks = plan.blocks.size();
    sums.load = plan.load;
    for (const Block& block : plan.blocks) {
        sums.requests += block.requests;
        sums.characters += charactersOf(block, limits, costs);
        sums.once += block.cost;
    }
    return sums;
}

Plan planOfSingles(std::span<const TagPlace> places, const Limits& limits, const CostModel& costs) {
    Plan plan;
    for (std::size_t at = 0; at < places.size(); ++at) {
        Block block = blockOf(places[at], at);
        finish(plan, block, rulesOf(places[at], limits, costs));
    }
    return plan;
}

Plan planOfFixedGap(std::span<const TagPlace> places, long gap, const Limits& limits,
                    const CostModel& costs) {
    Plan plan;
    const std::vector<std::size_t> order = inGroups(places);
    for (std::size_t at = 0; at < order.size();) {
        const TagPlace& first = places[order[at]];
        const AreaRules rules = rulesOf(first, limits, costs);
        Block block = blockOf(first, order[at]);
        for (++at; at < order.size(); ++at) {
            const TagPlace& next = places[order[at]];
            const long end = block.first + block.items;
            const long reach = std::max(end, next.first + next.items) - block.first;
            if (groupOf(next) != groupOf(first) || !rules.limits.onLine) break;
            if (next.first - end > gap || reach > rules.limits.mostItems) break;
            block.items = reach;
            block.tags.push_back(order[at]);
        }
        finish(plan, block, rules);
    }
    return plan;
}

}  // namespace poll
