// What a read costs on the line.
#pragma once

#include <chrono>
#include <map>

#include "wire/Times.h"

namespace poll {

/// The line, and what is known of each node. Values are set by whoever makes the plan.
struct CostModel {
    wire::LineRate rate{9600};
    wire::Mode mode = wire::Mode::Rtu;
    /// Characters of silence after which the driver takes a reply for complete; 0 where it knows
    /// the length of the reply.
    std::chrono::nanoseconds gapAfterReply{0};
    /// What the driver waits before a request, by node.
    std::map<int, std::chrono::nanoseconds> delays;
    /// From the end of a request to the first character of its reply, by node.
    std::map<int, std::chrono::nanoseconds> turnarounds;
    std::chrono::nanoseconds turnaround{0};  ///< Of the nodes that have none of their own.

    /// Time of the line for a read of `items` items of `itemBytes` bytes (0: bits) in one request.
    [[nodiscard]] std::chrono::nanoseconds ofRead(int node, long items, int itemBytes) const;
};

}  // namespace poll
