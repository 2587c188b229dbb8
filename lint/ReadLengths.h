// How long the replies to reads are. Pure.
#pragma once

#include <cstddef>

#include "lint/TagLines.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"
#include "wire/Bytes.h"

namespace lint {

/// Characters of the reply to a read of so many bytes.
std::size_t replyCharacters(wire::Mode mode, long long dataBytes);

/// Bytes that the longest single read of a node's area brings, as the configuration limits them.
/// 0 for the driver's own areas, which never use the line.
long long longestRead(const settings::AreaInfo& area, int node,
                      const settings::ScannedConfig& config,
                      const settings::Description& description);

/// Bytes that the longest request of one access to the tag brings. REQUIRES: the tag was accepted.
long long longestReadOf(const TagLine& tag, const settings::AreaInfo& area,
                        const settings::ScannedConfig& config,
                        const settings::Description& description);

}  // namespace lint
