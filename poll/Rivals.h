// Simpler ways to plan reads, to hold a plan against. Pure.
#pragma once

#include <array>

#include "poll/Plan.h"

namespace poll {

/// What a plan comes to.
struct PlanSums {
    std::size_t blocks = 0;
    long requests = 0;
    std::size_t characters = 0;        ///< Of every block once, requests and replies.
    std::chrono::nanoseconds once{0};  ///< Every block once.
    double load = 0;
};

PlanSums sumsOf(const Plan& plan, const Limits& limits, const CostModel& costs);

/// Characters of one read of a block.
std::size_t charactersOf(const Block& block, const Limits& limits, const CostModel& costs);

/// One request for each tag.
Plan planOfSingles(std::span<const TagPlace> places, const Limits& limits, const CostModel& costs);

/// Tags of one period share a read when no more than `gap` unused items lie between them, as long
/// as a request can carry them.
Plan planOfFixedGap(std::span<const TagPlace> places, long gap, const Limits& limits,
                    const CostModel& costs);

/// The gaps that are commonly set.
inline constexpr std::array kFixedGaps{0L, 8L, 50L};

}  // namespace poll
