// Why a read begins where it begins and holds what it holds, for people. Pure.
#pragma once

#include <string>

#include "poll/Draft.h"

namespace poll {

/// @return the items of a draft that no tag wants. REQUIRES: its tags are in order.
long fillerOf(const Draft& draft);

/// @param before  The read that begins in front of it in the same area; null for the first one.
std::string reasonOf(const Draft& draft, const Draft* before, const AreaRules& rules);

/// @return "12.7 ms".
std::string millisecondsText(std::chrono::nanoseconds time);

}  // namespace poll
