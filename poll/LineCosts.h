// What reads cost on the line of a configuration. Pure.
#pragma once

#include <span>

#include "poll/CostModel.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace poll {

/// What the configuration does not say.
struct LineHabits {
    bool endsByLength = false;                 ///< Replies end by their length, not by a silence.
    std::chrono::milliseconds shortestGap{0};  ///< Of a silence that ends a reply.
    std::chrono::nanoseconds turnaround{0};    ///< Of every node, as assumed.
};

/// @return the silence by which the driver of a line of `baud` knows the end of a reply: 120 bits,
/// in whole milliseconds.
std::chrono::milliseconds driverGap(int baud);

/// @param nodes  Those whose pause in front of requests is looked up.
CostModel costsOf(const settings::ScannedConfig& config, const settings::Description& description,
                  std::span<const int> nodes, const LineHabits& habits);

}  // namespace poll
