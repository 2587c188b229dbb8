// The nodes of the simulated lines. Pure.
#pragma once

#include <string_view>
#include <vector>

#include "sim/Simulator.h"

namespace cli {

/// Source: Modbus over Serial Line V1.02, 2.2.
inline constexpr int kHighestNode = 247;

/// @return nodes 1 to 10 with 32-bit registers unless `plain`.
std::vector<sim::NodeOptions> defaultSimNodes(bool plain);

/// @return the same nodes and those that the configuration names, 1..247, each with 32-bit
/// registers where its model has such.
std::vector<sim::NodeOptions> simNodesFor(std::string_view configText);

}  // namespace cli
