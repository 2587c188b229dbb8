#include "settings/ReadLimits.h"

#include <fmt/format.h>

#include <algorithm>

#include "settings/ConfigText.h"
#include "settings/NodeValue.h"

namespace settings {

bool isOfDriver(const AreaInfo& area) {
    return area.readCount <= 1;
}

long mostReadItems(const AreaInfo& area, int itemBytes, int node, const ScannedConfig& config,
                   const Description& description) {
    if (isOfDriver(area)) return 0;
    const bool bits = itemBytes == 0;
    const auto limit = nodeValue(config, description, node, bits ? "maxBitOptLen" : "maxOptLen");
    if (!limit) return area.readCount;
    return std::clamp<long>(bits ? limit->value : limit->value / itemBytes, 0, area.readCount);
}

AreaOffer offerOf(const AreaInfo& area, const ModelInfo* model) {
    if (model != nullptr) {
        for (const AreaOffer& offer : model->offers) {
            if (offer.area == area.name) return offer;
        }
    }
    return {area.name, area.min, area.max};
}

const ModelInfo* modelOf(const Description& description, const ScannedConfig& config, int node) {
    if (description.models.empty()) return nullptr;
    const auto own = itemOf(config, fmt::format("Node{}::model", node));
    const auto name = own ? own : itemOf(config, "model");
    const ModelInfo* found = name ? description.model(*name) : nullptr;
    return found != nullptr ? found : &description.models.front();
}

}  // namespace settings
