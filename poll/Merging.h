// Reads of different periods put together where that costs less. Pure.
#pragma once

#include "poll/Draft.h"

namespace poll {

/// @return the load that is saved when two reads become one; 0 when they cannot, or nothing is
/// saved.
double savingOf(const Draft& one, const Draft& other, const AreaRules& rules);

/// Merges pairs of reads as long as that lowers the load.
void mergeAll(Drafts& drafts, const AreaRules& rules);

/// Hands tags to reads of shorter periods that bring them anyway, and groups what is left again.
/// @return whether the load fell.
bool ridePassing(Drafts& drafts, const AreaRules& rules);

}  // namespace poll
