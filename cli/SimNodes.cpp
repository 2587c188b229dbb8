// Which nodes a simulated line has, by a configuration or without one.
#include "cli/SimNodes.h"

#include <set>

#include "settings/ConfigText.h"

namespace cli {
namespace {

constexpr int kDefaultNodes = 10;

sim::NodeOptions node(int address, bool longs) {
    sim::NodeOptions options;
    options.address = static_cast<std::uint8_t>(address);
    if (longs) options.longs = sim::LongRange{};
    return options;
}

bool hasLongs(std::string_view model) {
    return model == "3" || model == "4";
}

}  // namespace

std::vector<sim::NodeOptions> defaultSimNodes(bool plain) {
    std::vector<sim::NodeOptions> nodes;
    for (int address = 1; address <= kDefaultNodes; ++address) {
        nodes.push_back(node(address, !plain));
    }
    return nodes;
}

std::vector<sim::NodeOptions> simNodesFor(std::string_view configText) {
    std::set<int> addresses;
    for (int address = 1; address <= kDefaultNodes; ++address)
        addresses.insert(address);
    for (const int address : settings::nodesOf(configText)) {
        if (address >= 1 && address <= kHighestNode) addresses.insert(address);
    }
    std::vector<sim::NodeOptions> nodes;
    nodes.reserve(addresses.size());
    for (const int address : addresses) {
        nodes.push_back(node(address, hasLongs(settings::modelOf(configText, address))));
    }
    return nodes;
}

}  // namespace cli
