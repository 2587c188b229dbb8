// What reads of one area cost, as a rule that can be calculated with. Pure.
#pragma once

#include <chrono>

namespace poll {

/// A read in one request costs a fixed time and the time of its data.
struct ReadCost {
    std::chrono::nanoseconds request{0};  ///< Of a read without data.
    std::chrono::nanoseconds unit{0};     ///< Of the data of a begun unit.
    long itemsInUnit = 1;                 ///< 1 register, or the 8 bits of a byte.

    [[nodiscard]] constexpr long unitsOf(long items) const {
        return (items + itemsInUnit - 1) / itemsInUnit;
    }
    /// @param items  0..
    [[nodiscard]] constexpr std::chrono::nanoseconds of(long items) const {
        return request + unit * unitsOf(items);
    }
};

}  // namespace poll
