// How a list of tags is read in the least time on the line: blocks, each of them one request.
#pragma once

#include <chrono>
#include <cstddef>
#include <span>
#include <string>
#include <vector>

#include "poll/CostModel.h"
#include "poll/Limits.h"

namespace poll {

/// One tag as the planner sees it.
struct TagPlace {
    int node = 0;
    std::string area;
    bool bits = false;
    long first = 0;     ///< Item of the area, 0..; in a bit area the bit.
    long items = 1;     ///< 1..
    int itemBytes = 2;  ///< 0 for bits.
    std::chrono::milliseconds period{1000};
};

/// What one read brings. All of its tags lie within it.
struct Block {
    int node = 0;
    std::string area;
    bool bits = false;
    int itemBytes = 2;
    long first = 0;
    long items = 0;
    std::vector<std::size_t> tags;        ///< Indices into the places, sorted by first item; the
                                          ///< first of them begins the block.
    std::chrono::milliseconds period{0};  ///< The shortest of its tags.
    std::chrono::nanoseconds cost{0};     ///< One read on the line.
    int requests = 1;                     ///< More only for a tag wider than a request; 0 for the
                                          ///< areas of the driver's own.
    long fillerItems = 0;                 ///< Items that no tag wanted.
    std::string reason;                   ///< For people: why it begins where it begins.
};

struct Plan {
    std::vector<Block> blocks;  ///< By node, area and first item.
    double load = 0;            ///< Of the line at the wanted periods; 1.0 is all of its time.
};

/// @return the blocks that take the least of the line's time: the sum of each block's cost by its
/// period is minimal among all ways to group tags of equal periods, and no two blocks of different
/// periods could be merged for less. Every tag stands in exactly one block. Pure.
Plan makePlan(std::span<const TagPlace> places, const Limits& limits, const CostModel& costs);

}  // namespace poll
