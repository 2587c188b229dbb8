#include "lint/NodeValue.h"

#include <fmt/format.h>

#include "settings/NumberText.h"

namespace lint {

std::optional<NodeValue> nodeValue(const settings::ScannedConfig& config,
                                   const settings::Description& description,
                                   std::optional<int> node, const char* key) {
    const settings::ScannedItem* item =
        node ? config.item(fmt::format("Node{}::{}", *node, key)) : nullptr;
    if (item == nullptr) item = config.item(key);
    if (item != nullptr) return NodeValue{item, settings::readNumber(*item->value).value};
    const settings::ParameterInfo* parameter = description.parameter(key);
    if (parameter == nullptr || !parameter->defaultValue) return std::nullopt;
    return NodeValue{nullptr, settings::readNumber(*parameter->defaultValue).value};
}

}  // namespace lint
