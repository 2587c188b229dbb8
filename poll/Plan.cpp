#include "poll/Plan.h"

#include <map>
#include <tuple>

#include "poll/AreaPlan.h"
#include "poll/Reasons.h"

namespace poll {
namespace {

struct AreaKey {
    int node;
    std::string_view area;
    bool bits;
    int itemBytes;

    bool operator<(const AreaKey& other) const {
        return std::tie(node, area, bits, itemBytes) <
               std::tie(other.node, other.area, other.bits, other.itemBytes);
    }
};

using Areas = std::map<AreaKey, std::vector<AreaTag>>;

Areas areasOf(std::span<const TagPlace> places) {
    Areas areas;
    for (std::size_t at = 0; at < places.size(); ++at) {
        const TagPlace& place = places[at];
        areas[{place.node, place.area, place.bits, place.itemBytes}].push_back(
            {.index = at,
             .extent = {place.first, place.first + place.items},
             .period = std::max(place.period, std::chrono::milliseconds{1})});
    }
    return areas;
}

Block blockOf(const AreaKey& key, const Draft& draft, const AreaRules& rules) {
    Block block{.node = key.node,
                .area = std::string(key.area),
                .bits = key.bits,
                .itemBytes = key.itemBytes,
                .first = draft.extent.first,
                .items = draft.extent.items(),
                .tags = {},
                .period = draft.period,
                .cost = rules.costOf(draft.extent),
                .requests = static_cast<int>(rules.requestsOf(draft.extent)),
                .fillerItems = fillerOf(draft),
                .reason = {}};
    block.tags.reserve(draft.tags.size());
    for (const AreaTag& tag : draft.tags)
        block.tags.push_back(tag.index);
    return block;
}

void addArea(Plan& plan, const AreaKey& key, const Drafts& drafts, const AreaRules& rules) {
    const Draft* before = nullptr;
    for (const Draft& draft : drafts) {
        plan.blocks.push_back(blockOf(key, draft, rules));
        plan.blocks.back().reason = reasonOf(draft, before, rules);
        before = &draft;
    }
    plan.load += loadOf(drafts, rules);
}

}  // namespace

Plan makePlan(std::span<const TagPlace> places, const Limits& limits, const CostModel& costs) {
    Plan plan;
    for (const auto& [key, tags] : areasOf(places)) {
        const int itemBytes = key.bits ? 0 : key.itemBytes;
        AreaRules rules{.limits = limits.of(key.node, std::string(key.area), itemBytes),
                        .cost = costs.readCost(key.node, itemBytes)};
        rules.limits.mostItems = std::max(rules.limits.mostItems, 1L);
        addArea(plan, key, planArea(tags, rules), rules);
    }
    return plan;
}

}  // namespace poll
