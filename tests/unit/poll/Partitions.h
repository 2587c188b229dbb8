// Every way to group a few tags into reads, judged by a rule of its own, so that a planner can be
// held against the best of them.
#pragma once

#include <functional>
#include <optional>
#include <span>
#include <vector>

#include "poll/Plan.h"

namespace poll {

using Group = std::vector<std::size_t>;
using Grouping = std::vector<Group>;

/// Calls `visit` with every partition of 0 .. count - 1.
void forEachGrouping(std::size_t count, const std::function<void(const Grouping&)>& visit);

/// The load of a read of the tags, all of one node and area; nothing when no read can bring them:
/// they are too wide for a request, and none of them is as wide as all of them, or one that a
/// request can carry would be cut.
std::optional<double> loadOfGroup(std::span<const TagPlace> places, const Group& group, long most,
                                  const CostModel& costs);

/// @return the least load that any grouping has.
double leastLoad(std::span<const TagPlace> places, long most, const CostModel& costs);

}  // namespace poll
