// The plans of other masters: one request a tag, and blocks that read over gaps up to a fixed
// width.
#pragma once

#include <algorithm>
#include <cstddef>
#include <numeric>
#include <span>
#include <tuple>
#include <vector>

#include "poll/Plan.h"

namespace bench {

inline bool sameArea(const poll::TagPlace& a, const poll::TagPlace& b) {
    return a.node == b.node && a.area == b.area;
}

/// Time of the whole plan, one read of every block.
inline std::chrono::nanoseconds cycleOf(const std::vector<poll::Block>& blocks) {
    std::chrono::nanoseconds sum{0};
    for (const poll::Block& block : blocks)
        sum += block.cost;
    return sum;
}

inline poll::Block blockOf(std::size_t tag, const poll::TagPlace& place) {
    poll::Block block;
    block.node = place.node;
    block.area = place.area;
    block.bits = place.bits;
    block.itemBytes = place.itemBytes;
    block.first = place.first;
    block.items = place.items;
    block.tags = {tag};
    return block;
}

/// @param gap  The most unwanted items that two tags of a block may have between them; -1: one tag
/// a block. REQUIRES: no tag is wider than a request.
inline std::vector<poll::Block> fixedGapBlocks(std::span<const poll::TagPlace> places,
                                               const poll::Limits& limits,
                                               const poll::CostModel& costs, long gap) {
    std::vector<std::size_t> order(places.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::sort(order.begin(), order.end(), [&](std::size_t a, std::size_t b) {
        const auto key = [&](std::size_t tag) {
            return std::tuple(places[tag].node, places[tag].area, places[tag].first);
        };
        return key(a) < key(b);
    });
    std::vector<poll::Block> blocks;
    for (const std::size_t tag : order) {
        const poll::TagPlace& place = places[tag];
        poll::Block* last = blocks.empty() ? nullptr : &blocks.back();
        const long most = limits.of(place.node, place.area, place.itemBytes).mostItems;
        const bool joins = gap >= 0 && last != nullptr &&
                           sameArea(place, places[last->tags.front()]) &&
                           place.first - (last->first + last->items) <= gap &&
                           place.first + place.items - last->first <= most;
        if (joins) {
            last->items = std::max(last->items, place.first + place.items - last->first);
            last->tags.push_back(tag);
        } else {
            blocks.push_back(blockOf(tag, place));
        }
    }
    for (poll::Block& block : blocks)
        block.cost = costs.readCost(block.node, block.itemBytes).of(block.items);
    return blocks;
}

}  // namespace bench
