#include "poll/Merging.h"

#include <numeric>

#include "poll/Cover.h"
#include "poll/Start.h"

namespace poll {
namespace {

/// What is less is the rounding of sums, no saving.
constexpr double kLeastSaving = 1e-12;

Extent hull(const Extent& one, const Extent& other) {
    return {std::min(one.first, other.first), std::max(one.end, other.end)};
}

/// Whether a wide read brings all tags of another one, none of them cut by the end of a request.
bool holds(const Draft& wide, const Draft& other, const AreaRules& rules) {
    if (!rules.isWide(wide.extent) || !wide.extent.contains(other.extent)) return false;
    return std::all_of(other.tags.begin(), other.tags.end(), [&](const AreaTag& tag) {
        return rules.isWide(tag.extent) || rules.inOneRequest(wide.extent, tag.extent);
    });
}

bool canMerge(const Draft& one, const Draft& other, const AreaRules& rules) {
    if (one.alone || other.alone) return false;
    if (!rules.isWide(hull(one.extent, other.extent))) return true;
    return holds(one, other, rules) || holds(other, one, rules);
}

void absorb(Draft& into, Draft& from) {
    if (into.tags.size() < from.tags.size()) std::swap(into.tags, from.tags);
    into.tags.insert(into.tags.end(), from.tags.begin(), from.tags.end());
    into.extent = hull(into.extent, from.extent);
    into.period = std::min(into.period, from.period);
    from.tags.clear();
}

void sortByBeginning(Drafts& drafts) {
    std::sort(drafts.begin(), drafts.end(), [](const Draft& one, const Draft& other) {
        if (one.extent.first != other.extent.first) return one.extent.first < other.extent.first;
        return one.extent.end > other.extent.end;
    });
}

/// @return the item in front of which a read must begin to be worth merging with one that begins
/// no later: a hole that is dearer than a request is never worth it.
long reachOf(const Draft& draft, const AreaRules& rules) {
    if (rules.isWide(draft.extent)) return draft.extent.end;
    const long most = draft.extent.first + rules.limits.mostItems;
    if (rules.cost.unit.count() <= 0) return most;
    const long hole = (rules.cost.request / rules.cost.unit + 2) * rules.cost.itemsInUnit;
    return std::min(most, draft.extent.end + hole);
}

/// @return the read behind `at` with which most is saved; `at` itself when there is none.
std::size_t bestPartner(const Drafts& drafts, std::size_t at, const AreaRules& rules) {
    const long reach = reachOf(drafts[at], rules);
    std::size_t best = at;
    double most = 0;
    for (std::size_t other = at + 1; other < drafts.size(); ++other) {
        if (drafts[other].extent.first >= reach) break;
        if (drafts[other].tags.empty()) continue;
        const double saving = savingOf(drafts[at], drafts[other], rules);
        if (saving > most) {
            most = saving;
            best = other;
        }
    }
    return best;
}

bool mergeRound(Drafts& drafts, const AreaRules& rules) {
    sortByBeginning(drafts);
    bool merged = false;
    for (std::size_t at = 0; at < drafts.size(); ++at) {
        if (drafts[at].tags.empty() || drafts[at].alone) continue;
        for (std::size_t other = 0; (other = bestPartner(drafts, at, rules)) != at;) {
            absorb(drafts[at], drafts[other]);
            merged = true;
        }
    }
    std::erase_if(drafts, [](const Draft& draft) { return draft.tags.empty(); });
    return merged;
}

/// The reads, shortest periods in front, that have found their tags.
struct Passing {
    Drafts drafts;
    Cover requests;

    void add(Draft&& draft, const AreaRules& rules) {
        if (!draft.alone && !rules.isWide(draft.extent)) requests.add(draft.extent, drafts.size());
        drafts.push_back(std::move(draft));
    }
    /// @return the read that brings the tag often enough; null when there is none.
    Draft* ownerOf(const AreaTag& tag) {
        const auto owner = requests.ownerOf(tag.extent);
        if (!owner || drafts[*owner].period > tag.period) return nullptr;
        return &drafts[*owner];
    }
};

}  // namespace

double loadOf(const Drafts& drafts, const AreaRules& rules) {
    return std::accumulate(drafts.begin(), drafts.end(), 0.0, [&](double sum, const Draft& draft) {
        return sum + rules.loadOf(draft);
    });
}

double savingOf(const Draft& one, const Draft& other, const AreaRules& rules) {
    if (!canMerge(one, other, rules)) return 0;
    const double apart = rules.loadOf(one) + rules.loadOf(other);
    const double together =
        rules.loadOf(hull(one.extent, other.extent), std::min(one.period, other.period));
    return apart - together > kLeastSaving * apart ? apart - together : 0;
}

void mergeAll(Drafts& drafts, const AreaRules& rules) {
    while (mergeRound(drafts, rules)) {
    }
}

bool ridePassing(Drafts& drafts, const AreaRules& rules) {
    const double before = loadOf(drafts, rules);
    std::stable_sort(drafts.begin(), drafts.end(), [](const Draft& one, const Draft& other) {
        return one.period < other.period;
    });
    Passing passing;
    for (Draft& draft : drafts) {
        if (draft.alone || rules.isWide(draft.extent)) {
            passing.add(std::move(draft), rules);
            continue;
        }
        std::vector<AreaTag> left;
        for (const AreaTag& tag : draft.tags) {
            if (Draft* const owner = passing.ownerOf(tag))
                owner->add(tag);
            else
                left.push_back(tag);
        }
        if (left.size() == draft.tags.size())
            passing.add(std::move(draft), rules);
        else
            for (Draft& rest : startOf(std::move(left), rules, Periods::Together))
                passing.add(std::move(rest), rules);
    }
    drafts = std::move(passing.drafts);
    return before - loadOf(drafts, rules) > kLeastSaving * before;
}

}  // namespace poll
