// The driver's configuration text as it is built and looked into. Pure.
//
// The text is "CfgVer=1" and items "key=value" or "Node<n>::key=value" between white space; of
// several items with one key the first counts.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "settings/ConfigScan.h"

namespace settings {

struct ConfigItem {
    std::string key;
    std::string value;
};

/// @return the items that make a whole configuration together: node 1, com1, 19200 baud, no
/// parity, 1 stop bit, RTU.
/// @param model  "1" suits most devices; "3" also reaches the simulator's 32-bit registers.
std::string defaultConfig(std::string_view model);

/// Splits "key=value" at the first "=".
/// Errors: TextError without "=", for an empty key and for white space in the key or,
/// blanks excepted, in the value.
ConfigItem parseConfigItem(std::string_view text);

/// @return the text with the items in front of its own, so that they win. A text without the
/// marker "CfgVer=1" comes back unchanged: the driver will say what it thinks of it.
std::string withItems(const std::string& text, const std::vector<ConfigItem>& items);

/// @return the value of the item called `key`, e.g. "uart" or "Node2::model".
std::optional<std::string> itemOf(std::string_view text, std::string_view key);
std::optional<std::string> itemOf(const ScannedConfig& config, std::string_view key);

/// @return the node numbers that the text names, "defNodeId" included, ascending, each once.
std::vector<int> nodesOf(std::string_view text);
std::vector<int> nodesOf(const ScannedConfig& config);

/// @return the value of an item that a node may have of its own, else that of all nodes.
std::optional<std::string> nodeItemOf(std::string_view text, int node, std::string_view key);

/// @return the model of a node, which may be its own or that of all nodes.
std::string modelOf(std::string_view text, int node);

}  // namespace settings
