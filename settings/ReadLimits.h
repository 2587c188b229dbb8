// What a driver and its configuration let one read of an area carry, and where the area ends. Pure.
#pragma once

#include <string>

#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace settings {

/// The driver's own areas hold one value; it never goes over the line, whatever the node.
bool isOfDriver(const AreaInfo& area);

/// @param itemBytes  Of one item of the area; 0: a bit.
/// @return the items that one request may carry; 0 for the driver's own areas, and where the
/// configuration allows less than one item.
long mostReadItems(const AreaInfo& area, int itemBytes, int node, const ScannedConfig& config,
                   const Description& description);

/// @return the addresses that a model gives an area; the area's own ones where the model, which may
/// be null, does not offer it.
AreaOffer offerOf(const AreaInfo& area, const ModelInfo* model);

/// @return the model of a node, the first one where it is not named or unknown; null in a
/// description without models.
const ModelInfo* modelOf(const Description& description, const ScannedConfig& config, int node);

}  // namespace settings
