#include "lint/ReadLengths.h"

#include <algorithm>

#include "lint/NodeValue.h"
#include "lint/TagSpan.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

constexpr long long kBitsOfAByte = 8;

/// Of an area of registers.
long long itemBytes(const settings::AreaInfo& area) {
    const values::ValueType* natural = values::typeNamed(area.naturalType);
    return natural == nullptr ? 1 : natural->bytes;
}

long long bytesOf(long long items, const settings::AreaInfo& area) {
    return isBitArea(area) ? (items + kBitsOfAByte - 1) / kBitsOfAByte : items * itemBytes(area);
}

/// The items that one request may carry.
long long mostItems(const settings::AreaInfo& area, int node, const settings::ScannedConfig& config,
                    const settings::Description& description) {
    if (area.readCount <= 1) return 0;
    const bool bits = isBitArea(area);
    const auto limit = nodeValue(config, description, node, bits ? "maxBitOptLen" : "maxOptLen");
    if (!limit) return area.readCount;
    const long long items = bits ? limit->value : limit->value / itemBytes(area);
    return std::clamp<long long>(items, 0, area.readCount);
}

}  // namespace

std::size_t replyCharacters(wire::Mode mode, long long dataBytes) {
    // Node, function and byte count stand in front of the data.
    const auto message = static_cast<std::size_t>(1 + 1 + 1 + dataBytes);
    return mode == wire::Mode::Rtu ? message + 2 : 1 + 2 * (message + 1) + 2;
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
