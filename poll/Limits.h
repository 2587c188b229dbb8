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
    long firstItem = 0;    ///< A request begins here at the earliest ...
    long endItem = std::numeric_limits<long>::max();  ///< ... and ends in front of it.
};

/// Limits by node and area.
class Limits {
  public:
    /// What counts for areas that set() has not named: 2000 bits or 125 registers.
    /// Source: Modbus Application Protocol V1.1b3, 6.1 and 6.3.
    static constexpr AreaLimits kBits{.mostItems = 2000};
    static constexpr AreaLimits kRegisters{.mostItems = 125};

    void set(int node, const std::string& area, const AreaLimits& limits) {
        areas_[{node, area}] = limits;
    }
    [[nodiscard]] AreaLimits of(int node, const std::string& area, bool bits) const {
        const auto found = areas_.find({node, area});
        if (found != areas_.end()) return found->second;
        return bits ? kBits : kRegisters;
    }

  private:
    std::map<std::pair<int, std::string>, AreaLimits> areas_;
};

}  // namespace poll
