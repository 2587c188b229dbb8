#include "poll/TagPlacing.h"

#include <algorithm>

#include "settings/ReadLimits.h"
#include "values/ItemSpan.h"

namespace poll {
namespace {

std::optional<std::string> fieldOf(IProtocol& protocol, const ITag& tag, const char* name) {
    auto* const fields = static_cast<IProtocol7*>(protocol.ConvertTo("IProtocol7"));
    if (fields == nullptr) return std::nullopt;
    const int position = fields->getTagUriFieldPosition(name);
    if (position < 0) return std::nullopt;
    int length = 0;
    const char* const text = fields->getTagUriField(&tag, position, &length);
    if (text == nullptr) return std::nullopt;
    const std::string_view field(text, static_cast<std::size_t>(std::max(length, 0)));
    const std::size_t begin = field.find_first_not_of(" \t");
    if (begin == std::string_view::npos) return std::string();
    return std::string(field.substr(begin, field.find_last_not_of(" \t") + 1 - begin));
}

AreaLimits limitsOfArea(const settings::AreaInfo& area, const TagPlace& place,
                        const settings::ScannedConfig& config,
                        const settings::Description& description) {
    const auto offer = settings::offerOf(area, settings::modelOf(description, config, place.node));
    const long most =
        settings::mostReadItems(area, place.itemBytes, place.node, config, description);
    // Where the configuration allows less than an item, the engine reads item by item.
    return {.mostItems = std::max(most, 1L),
            .firstItem = 0,
            .endItem = offer.max - offer.min + 1,
            .onLine = !settings::isOfDriver(area)};
}

}  // namespace

std::optional<TagPlace> placeOf(const ITag& tag, IProtocol& protocol,
                                const settings::Description& description) {
    const auto* const nodes = static_cast<IProtocol4*>(protocol.ConvertTo("IProtocol4"));
    const auto name = fieldOf(protocol, tag, "memorytype");
    const settings::AreaInfo* const area = name ? description.area(*name) : nullptr;
    if (nodes == nullptr || area == nullptr) return std::nullopt;
    const int itemBytes = values::itemBytesOf(area->naturalType);
    const values::BitSpan span =
        values::bitSpan({tag.GetByteOffset(), tag.GetBitIndex(), tag.GetVarType(),
                         tag.GetItemType(), tag.GetVarLength()},
                        itemBytes);
    const long long unit = itemBytes == 0 ? 1 : itemBytes * 8LL;
    TagPlace place{.node = nodes->GetNodeID(&tag), .area = *name, .bits = itemBytes == 0};
    // A block begins with its first tag's first item, as the driver counts it.
    place.first = static_cast<long>(itemBytes == 0 ? span.begin : tag.GetByteOffset());
    place.items = static_cast<long>((span.end + unit - 1) / unit) - place.first;
    place.itemBytes = itemBytes;
    return place;
}

std::optional<TagPlace> placeOf(const ITag& tag, const runtime::Channel& channel,
                                const settings::Description& description) {
    return placeOf(tag, channel.protocol(), description);
}

Limits limitsOf(std::span<const TagPlace> places, const settings::ScannedConfig& config,
                const settings::Description& description) {
    Limits limits;
    const TagPlace* known = nullptr;
    for (const TagPlace& place : places) {
        if (known != nullptr && known->node == place.node && known->area == place.area) continue;
        known = &place;
        if (limits.has(place.node, place.area)) continue;
        const settings::AreaInfo* const area = description.area(place.area);
        if (area == nullptr) continue;
        limits.set(place.node, place.area, limitsOfArea(*area, place, config, description));
    }
    return limits;
}

std::vector<int> nodesOf(std::span<const TagPlace> places) {
    std::vector<int> nodes;
    nodes.reserve(places.size());
    for (const TagPlace& place : places)
        nodes.push_back(place.node);
    std::sort(nodes.begin(), nodes.end());
    nodes.erase(std::unique(nodes.begin(), nodes.end()), nodes.end());
    return nodes;
}

}  // namespace poll
