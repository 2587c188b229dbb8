#include "poll/Start.h"

#include <tuple>

#include "poll/Cover.h"

namespace poll {
namespace {

using Tags = std::span<const AreaTag>;

/// Drafts that grow by one period after the other.
class Start {
  public:
    explicit Start(const AreaRules& rules) : rules_(rules) {}

    /// @param tags  Of one period, in order.
    void add(Tags tags) {
        for (const AreaTag& tag : tags)
            if (rules_.isWide(tag.extent)) addWide(tag);
        addNarrow(tags);
    }
    Drafts take() { return std::move(drafts_); }

  private:
    void addWide(const AreaTag& tag) {
        if (const auto owner = wide_.ownerOf(tag.extent)) {
            drafts_[*owner].add(tag);
            return;
        }
        const std::size_t owner = open(tag);
        wide_.add(tag.extent, owner);
        const long most = rules_.limits.mostItems;
        for (long at = tag.extent.first; at < tag.extent.end; at += most)
            requests_.add({at, std::min(at + most, tag.extent.end)}, owner);
    }

    void addNarrow(Tags tags) {
        std::vector<AreaTag> outer;
        std::vector<std::pair<AreaTag, std::size_t>> nested;  // With the outer one's index.
        for (const AreaTag& tag : tags) {
            if (rules_.isWide(tag.extent)) continue;
            if (const auto owner = requests_.ownerOf(tag.extent))
                drafts_[*owner].add(tag);
            else if (!outer.empty() && outer.back().extent.contains(tag.extent))
                nested.emplace_back(tag, outer.size() - 1);
            else
                outer.push_back(tag);
        }
        const std::vector<std::size_t> owners = group(outer);
        for (const auto& [tag, at] : nested)
            drafts_[owners[at]].add(tag);
    }

    /// @return each tag's draft.
    std::vector<std::size_t> group(const std::vector<AreaTag>& outer) {
        std::vector<Extent> extents;
        extents.reserve(outer.size());
        for (const AreaTag& tag : outer)
            extents.push_back(tag.extent);
        const auto begins = leastTime(extents, rules_.cost, rules_.limits.mostItems);
        std::vector<std::size_t> owners;
        owners.reserve(outer.size());
        const std::size_t old = drafts_.size();
        for (std::size_t at = 0, next = 0; at < outer.size(); ++at) {
            if (next < begins.size() && begins[next] == at) {
                ++next;
                open(outer[at]);
            } else {
                drafts_.back().add(outer[at]);
            }
            owners.push_back(drafts_.size() - 1);
        }
        for (std::size_t at = old; at < drafts_.size(); ++at)
            requests_.add(drafts_[at].extent, at);
        return owners;
    }

    std::size_t open(const AreaTag& tag) {
        drafts_.emplace_back().add(tag);
        return drafts_.size() - 1;
    }

    const AreaRules& rules_;
    Drafts drafts_;
    Cover wide_;      // Whole reads.
    Cover requests_;  // What single requests bring.
};

}  // namespace

Drafts startOf(std::vector<AreaTag> tags, const AreaRules& rules, Periods periods) {
    const bool apart = periods == Periods::Apart;
    std::sort(tags.begin(), tags.end(), [apart](const AreaTag& one, const AreaTag& other) {
        if (apart && one.period != other.period) return one.period < other.period;
        return inOrder(one, other);
    });
    Start start(rules);
    for (std::size_t at = 0; at < tags.size();) {
        std::size_t end = at;
        while (end < tags.size() && (!apart || tags[end].period == tags[at].period))
            ++end;
        start.add(Tags(tags).subspan(at, end - at));
        at = end;
    }
    return start.take();
}

}  // namespace poll
