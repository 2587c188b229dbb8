// Timeouts that are shorter than what the line takes for a reply. Pure.
#pragma once

#include <vector>

#include "lint/Finding.h"
#include "lint/TagLines.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace lint {

/// Rule: short-timeout. Drivers wait for a reply's first byte for as long as the timeout, from the
/// end of the request on, and then for as long once more for all the rest.
/// @param tags  Their reads count, each on its own; without any, the longest that a request may
/// ask for does. Tags that the driver refused do not count.
/// @return at most one warning for each timeout that the configuration gives, or leaves out, with
/// the longest reply to which it applies.
Findings lintTimeouts(const settings::ScannedConfig& config,
                      const settings::Description& description, const std::vector<TagLine>& tags);

}  // namespace lint
