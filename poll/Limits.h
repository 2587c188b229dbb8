// What one request of an area may carry.
#pragma once

#include <limits>
#include <map>
#include <string>
#include <utility>

namespace poll {

/// Limits of one area of one node.
struct AreaLimits {
    long mostItems = 125;  ///< Items of one request, 1..
    long firstItem = 0;    ///< What begins in front of it, or ends behind the end, is refused.
    long endItem = std::numeric_limits<long>::max();
    bool onLine = true;  ///< false: an area of the driver's own; a read of it sends nothing.
};

/// Limits by node and area.
class Limits {
  public:
    /// What counts for areas that set() has not named.
    /// Source: Modbus Application Protocol V1.1b3, 6.1 and 6.3.
    static constexpr long kMostBits = 2000;
    static constexpr long kMostDataBytes = 250;

    void set(int node, const std::string& area, const AreaLimits& limits) {
        areas_[{node, area}] = limits;
    }

    [[nodiscard]] bool has(int node, const std::string& area) const {
        return areas_.contains({node, area});
    }

    /// @param itemBytes  Of one item; 0: a bit.
    [[nodiscard]] AreaLimits of(int node, const std::string& area, int itemBytes) const {
        const auto found = areas_.find({node, area});
        if (found != areas_.end()) return found->second;
        return {.mostItems = itemBytes == 0 ? kMostBits : kMostDataBytes / itemBytes};
    }

  private:
    std::map<std::pair<int, std::string>, AreaLimits> areas_;
};

}  // namespace poll
