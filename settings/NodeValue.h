// What a parameter is for one node. Pure.
#pragma once

#include <optional>

#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace settings {

struct NodeValue {
    const ScannedItem* item;  ///< That says it; null: the driver's default.
    long value;
};

/// @param node  Nothing: what serves the nodes without an item of their own.
/// @return nothing when neither the configuration nor the description knows the number.
std::optional<NodeValue> nodeValue(const ScannedConfig& config, const Description& description,
                                   std::optional<int> node, const char* key);

}  // namespace settings
