// Where a driver's tags are, and what it lets one read carry.
#pragma once

#include <optional>
#include <span>
#include <string>
#include <vector>

#include "poll/Plan.h"
#include "runtime/Channel.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace poll {

/// @param description  The driver's own.
/// @return the tag's place, its period still to be set; nothing for a driver that does not tell
/// nodes and fields, or an area that its description does not know.
std::optional<TagPlace> placeOf(const ITag& tag, IProtocol& protocol,
                                const settings::Description& description);
std::optional<TagPlace> placeOf(const ITag& tag, const runtime::Channel& channel,
                                const settings::Description& description);

/// @return the limits of the places' areas, as the driver describes them and the configuration
/// lowers them.
Limits limitsOf(std::span<const TagPlace> places, const settings::ScannedConfig& config,
                const settings::Description& description);

/// @return the nodes of the places, each once, in ascending order.
std::vector<int> nodesOf(std::span<const TagPlace> places);

}  // namespace poll
