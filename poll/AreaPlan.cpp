#include "poll/AreaPlan.h"

#include "poll/Merging.h"
#include "poll/Start.h"

namespace poll {
namespace {

/// A read that the driver refuses, or that sends nothing, must not be another tag's as well.
bool standsAlone(const AreaTag& tag, const AreaLimits& limits) {
    return !limits.onLine || tag.extent.first < limits.firstItem ||
           tag.extent.end > limits.endItem || tag.extent.items() <= 0;
}

bool haveOnePeriod(const std::vector<AreaTag>& tags) {
    return std::all_of(tags.begin(), tags.end(),
                       [&](const AreaTag& tag) { return tag.period == tags.front().period; });
}

/// Lowers the load until no step does.
void improve(Drafts& drafts, const AreaRules& rules) {
    mergeAll(drafts, rules);
    for (Drafts next = drafts; ridePassing(next, rules); next = drafts) {
        drafts = std::move(next);
        mergeAll(drafts, rules);
    }
}

Drafts planShared(const std::vector<AreaTag>& tags, const AreaRules& rules) {
    Drafts apart = startOf(tags, rules, Periods::Apart);
    if (haveOnePeriod(tags)) return apart;
    Drafts together = startOf(tags, rules, Periods::Together);
    improve(apart, rules);
    improve(together, rules);
    return loadOf(together, rules) < loadOf(apart, rules) ? together : apart;
}

}  // namespace

Drafts planArea(const std::vector<AreaTag>& tags, const AreaRules& rules) {
    std::vector<AreaTag> shared;
    Drafts lonely;
    for (const AreaTag& tag : tags) {
        if (!standsAlone(tag, rules.limits)) {
            shared.push_back(tag);
            continue;
        }
        lonely.emplace_back().add(tag);
        lonely.back().alone = true;
    }
    Drafts drafts = planShared(shared, rules);
    drafts.insert(drafts.end(), lonely.begin(), lonely.end());
    for (Draft& draft : drafts)
        std::sort(draft.tags.begin(), draft.tags.end(), inOrder);
    std::sort(drafts.begin(), drafts.end(), [](const Draft& one, const Draft& other) {
        return inOrder(one.tags.front(), other.tags.front());
    });
    return drafts;
}

}  // namespace poll
