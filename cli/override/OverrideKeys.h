// The keys under which drivers of the family store overrides. Pure.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace cli {

/// "tempNode5": the slave address of node 5, as text.
std::string addressKey(int node);
/// @return the node of such a key, whose number may be hexadecimal or octal; nothing for others.
std::optional<int> nodeOfAddressKey(std::string_view key);

/// @return the number in such a key as it is written, e.g. "0x0A"; nothing for others.
std::optional<std::string> addressNumber(std::string_view key);

/// "node5_ModiconMode": whether node 5 counts registers from 1, a boolean.
std::string modiconKey(int node);
std::optional<int> nodeOfModiconKey(std::string_view key);
/// Whether the key is such a one, whatever stands for the node.
bool isModiconKey(std::string_view key);

}  // namespace cli
