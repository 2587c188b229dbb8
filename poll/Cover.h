// Which interval of several contains another. Pure.
#pragma once

#include <cstddef>
#include <iterator>
#include <map>
#include <optional>

#include "poll/LeastTime.h"

namespace poll {

/// Intervals with owners. One that lies inside another is not kept: its owner holds nothing that
/// the other's does not.
class Cover {
  public:
    void add(const Extent& interval, std::size_t owner) {
        if (ownerOf(interval)) return;
        auto at = intervals_.lower_bound(interval.first);
        while (at != intervals_.end() && at->second.end <= interval.end)
            at = intervals_.erase(at);
        intervals_[interval.first] = {interval.end, owner};
    }

    /// @return the owner of an interval that contains the extent.
    [[nodiscard]] std::optional<std::size_t> ownerOf(const Extent& extent) const {
        // None contains another, so the last that begins in time is also the last to end.
        const auto behind = intervals_.upper_bound(extent.first);
        if (behind == intervals_.begin()) return std::nullopt;
        const Held& last = std::prev(behind)->second;
        if (last.end < extent.end) return std::nullopt;
        return last.owner;
    }

  private:
    struct Held {
        long end;
        std::size_t owner;
    };
    std::map<long, Held> intervals_;  // By their beginnings.
};

}  // namespace poll
