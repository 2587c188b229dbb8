#include "settings/NodeValue.h"

#include <fmt/format.h>

#include "settings/NumberText.h"

namespace settings {

std::optional<NodeValue> nodeValue(const ScannedConfig& config, const Description& description,
                                   std::optional<int> node, const char* key) {
    const ScannedItem* item = node ? config.item(fmt::format("Node{}::{}", *node, key)) : nullptr;
    if (item == nullptr) item = config.item(key);
    if (item != nullptr) return NodeValue{item, readNumber(*item->value).value};
    const ParameterInfo* parameter = description.parameter(key);
    if (parameter == nullptr || !parameter->defaultValue) return std::nullopt;
    return NodeValue{nullptr, readNumber(*parameter->defaultValue).value};
}

}  // namespace settings
