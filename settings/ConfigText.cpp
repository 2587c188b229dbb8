#include "settings/ConfigText.h"

#include <fmt/format.h>

#include <charconv>
#include <set>

#include "settings/NumberText.h"
#include "settings/TextError.h"

namespace settings {
namespace {

constexpr std::string_view kMarker = "CfgVer=1";
constexpr std::string_view kWhite = " \t\n\v\f\r";

/// A blank inside a value is spelled "&nbsp;".
std::string encoded(std::string_view value) {
    std::string text;
    for (const char c : value) {
        if (c == ' ') {
            text += "&nbsp;";
        } else {
            text += c;
        }
    }
    return text;
}

/// @return the number between "Node" and "::"; nothing where another text stands there.
std::optional<int> nodeOf(const ScannedItem& item) {
    if (!item.node) return std::nullopt;
    const char* const end = item.node->data() + item.node->size();
    int node = 0;
    const auto [stop, error] = std::from_chars(item.node->data(), end, node);
    if (error != std::errc{} || stop != end) return std::nullopt;
    return node;
}

}  // namespace

std::string defaultConfig(std::string_view model) {
    return fmt::format(
        "{} defNodeId=1 model={} txMode=RTU uart=com1 baudrate=19200 parity=none bits=8 stopbits=1 "
        "mode=RS-232",
        kMarker, model);
}

ConfigItem parseConfigItem(std::string_view text) {
    const auto refuse = [text](std::string_view why) {
        throw TextError(fmt::format("'{}' is no KEY=VALUE: {}", text, why));
    };
    const std::size_t equals = text.find('=');
    if (equals == std::string_view::npos) refuse("there is no '='");
    const std::string_view key = text.substr(0, equals);
    const std::string_view value = text.substr(equals + 1);
    if (key.empty()) refuse("the key is empty");
    if (key.find_first_of(kWhite) != std::string_view::npos) refuse("white space in the key");
    if (value.find_first_of(kWhite.substr(1)) != std::string_view::npos) {
        refuse("white space other than blanks in the value");
    }
    return {std::string(key), std::string(value)};
}

std::string withItems(const std::string& text, const std::vector<ConfigItem>& items) {
    const std::size_t marker = text.find(kMarker);
    if (marker == std::string::npos || items.empty()) return text;
    std::string front;
    for (const ConfigItem& item : items)
        front += ' ' + item.key + '=' + encoded(item.value);
    std::string whole = text;
    return whole.insert(marker + kMarker.size(), front + ' ');
}

std::optional<std::string> itemOf(std::string_view text, std::string_view key) {
    return itemOf(scanConfig({}, text), key);
}

std::optional<std::string> itemOf(const ScannedConfig& config, std::string_view key) {
    const ScannedItem* const item = config.item(key);
    return item != nullptr ? item->value : std::nullopt;
}

std::vector<int> nodesOf(std::string_view text) {
    return nodesOf(scanConfig({}, text));
}

std::vector<int> nodesOf(const ScannedConfig& config) {
    std::set<int> nodes;
    if (const auto node = itemOf(config, "defNodeId")) {
        nodes.insert(static_cast<int>(readNumber(*node).value));
    }
    for (const ScannedItem& item : config.items) {
        if (const auto node = nodeOf(item)) nodes.insert(*node);
    }
    return {nodes.begin(), nodes.end()};
}

std::optional<std::string> nodeItemOf(std::string_view text, int node, std::string_view key) {
    const ScannedConfig config = scanConfig({}, text);
    const auto own = itemOf(config, fmt::format("Node{}::{}", node, key));
    return own ? own : itemOf(config, key);
}

std::string modelOf(std::string_view text, int node) {
    return nodeItemOf(text, node, "model").value_or("1");
}

}  // namespace settings
