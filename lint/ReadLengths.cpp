#include "lint/ReadLengths.h"

#include <algorithm>

#include "lint/TagSpan.h"
#include "settings/ReadLimits.h"
#include "values/ItemSpan.h"
#include "wire/TransactionCost.h"

namespace lint {
namespace {

long long bytesOf(long long items, const settings::AreaInfo& area) {
    const int itemBytes = values::itemBytesOf(area.naturalType);
    const auto count = static_cast<std::size_t>(items);
    return static_cast<long long>(itemBytes == 0 ? wire::packedBytes(count)
                                                 : count * static_cast<std::size_t>(itemBytes));
}

/// The items that one request may carry.
long long mostItems(const settings::AreaInfo& area, int node, const settings::ScannedConfig& config,
                    const settings::Description& description) {
    return settings::mostReadItems(area, values::itemBytesOf(area.naturalType), node, config,
                                   description);
}

}  // namespace

std::size_t replyCharacters(wire::Mode mode, long long dataBytes) {
    // Node, function and byte count stand in front of the data.
    return wire::frameLength(mode, static_cast<std::size_t>(1 + 1 + 1 + dataBytes));
}

long long longestRead(const settings::AreaInfo& area, int node,
                      const settings::ScannedConfig& config,
                      const settings::Description& description) {
    return bytesOf(mostItems(area, node, config, description), area);
}

long long longestReadOf(const TagLine& tag, const settings::AreaInfo& area,
                        const settings::ScannedConfig& config,
                        const settings::Description& description) {
    const TagSpan span = tagSpan(*tag.facts, area);
    const long long items = std::min(span.endItem() - span.firstItem(),
                                     mostItems(area, tag.facts->node, config, description));
    return bytesOf(items, area);
}

}  // namespace lint
