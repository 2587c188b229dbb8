// The plan of one area of one node. Pure.
#pragma once

#include "poll/Draft.h"

namespace poll {

/// @return the reads, in the order in which they begin; the tags of each in order. Tags of equal
/// periods are grouped for the least time there is; no two reads could be merged for less.
Drafts planArea(const std::vector<AreaTag>& tags, const AreaRules& rules);

}  // namespace poll
