// Reads of one area while they are being planned. Pure.
#pragma once

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <vector>

#include "poll/LeastTime.h"
#include "poll/Limits.h"

namespace poll {

/// A tag of the area.
struct AreaTag {
    std::size_t index;  ///< Among all places.
    Extent extent;
    std::chrono::milliseconds period;  ///< 1..
};

/// In front stands what begins first, of those what is longer.
inline bool inOrder(const AreaTag& one, const AreaTag& other) {
    if (one.extent.first != other.extent.first) return one.extent.first < other.extent.first;
    if (one.extent.end != other.extent.end) return one.extent.end > other.extent.end;
    return one.index < other.index;
}

/// A read to be.
struct Draft {
    Extent extent{0, 0};
    std::chrono::milliseconds period{0};  ///< The shortest of its tags.
    std::vector<AreaTag> tags;
    bool alone = false;  ///< Can share with nobody: the driver will refuse it, or sends nothing.

    void add(const AreaTag& tag) {
        if (tags.empty()) {
            extent = tag.extent;
            period = tag.period;
        }
        extent = {std::min(extent.first, tag.extent.first), std::max(extent.end, tag.extent.end)};
        period = std::min(period, tag.period);
        tags.push_back(tag);
    }
};

using Drafts = std::vector<Draft>;

/// What holds for all reads of the area.
struct AreaRules {
    AreaLimits limits;
    ReadCost cost;

    [[nodiscard]] bool isWide(const Extent& extent) const {
        return extent.items() > limits.mostItems;
    }
    [[nodiscard]] long requestsOf(const Extent& extent) const {
        if (!limits.onLine) return 0;
        return std::max(1L, (extent.items() + limits.mostItems - 1) / limits.mostItems);
    }
    /// @return the line's time for one read; a wide one is cut into requests, all of them but the
    /// last full.
    [[nodiscard]] std::chrono::nanoseconds costOf(const Extent& extent) const {
        const long requests = requestsOf(extent);
        if (requests == 0) return std::chrono::nanoseconds{0};
        const long rest = extent.items() - (requests - 1) * limits.mostItems;
        return cost.of(limits.mostItems) * (requests - 1) + cost.of(std::max(rest, 0L));
    }
    /// @return the part of the line's time that reads of the extent take.
    [[nodiscard]] double loadOf(const Extent& extent, std::chrono::milliseconds period) const {
        return std::chrono::duration<double>(costOf(extent)) /
               std::chrono::duration<double>(period);
    }
    [[nodiscard]] double loadOf(const Draft& draft) const {
        return loadOf(draft.extent, draft.period);
    }
    /// @return whether the extent lies in one of the requests that a wide read is cut into.
    [[nodiscard]] bool inOneRequest(const Extent& wide, const Extent& extent) const {
        if (!wide.contains(extent)) return false;
        const auto request = [&](long item) { return (item - wide.first) / limits.mostItems; };
        return request(extent.first) == request(extent.end - 1);
    }
};

/// @return the sum of the drafts' loads.
double loadOf(const Drafts& drafts, const AreaRules& rules);

}  // namespace poll
