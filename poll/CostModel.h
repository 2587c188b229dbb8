// What reads cost on a line. Pure.
#pragma once

#include <chrono>
#include <cstddef>
#include <map>

#include "poll/ReadCost.h"
#include "wire/TransactionCost.h"

namespace poll {

/// A line, and what is known of its nodes.
struct CostModel {
    wire::LineRate rate{9600};
    wire::Mode mode = wire::Mode::Rtu;
    /// The silence by which the driver knows the end of a reply; 0 where the reply's length tells
    /// it. The standard's silence between frames is kept in both cases.
    std::chrono::nanoseconds gapAfterReply{0};
    /// What the driver waits in front of a request, by node; 0 for nodes that are not there.
    std::map<int, std::chrono::nanoseconds> delays;
    /// From the end of a request to its reply, as measured or assumed, by node.
    std::map<int, std::chrono::nanoseconds> turnarounds;
    std::chrono::nanoseconds turnaround{0};  ///< Of nodes that have none of their own.

    /// What one request for items of `itemBytes` bytes (0: bits) costs.
    [[nodiscard]] ReadCost readCost(int node, int itemBytes) const;
    /// Characters of one request and its reply.
    [[nodiscard]] std::size_t readCharacters(long items, int itemBytes) const;
};

}  // namespace poll
