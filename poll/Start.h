// The plan of an area for tags of equal periods, and what it is for several periods at first. Pure.
#pragma once

#include "poll/Draft.h"

namespace poll {

enum class Periods : std::uint8_t {
    Apart,     ///< Each period has reads of its own.
    Together,  ///< Tags share reads as if all had the shortest period.
};

/// Plans from the shortest period to the longest. What lies within the reads of a shorter period is
/// theirs and costs nothing; the tags of the period that are left are grouped for the least time.
/// A tag wider than a request is a read of its own; what it brings anyway is not read again, but a
/// tag that would be cut by the end of a request is.
/// @param tags  All can share a read.
Drafts startOf(std::vector<AreaTag> tags, const AreaRules& rules, Periods periods);

}  // namespace poll
