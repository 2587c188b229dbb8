#include "cli/ConfigText.h"

#include <fmt/format.h>

#include <charconv>
#include <cstdlib>
#include <set>

#include "cli/ExitCode.h"

namespace cli {
namespace {

constexpr std::string_view kMarker = "CfgVer=1";
constexpr std::string_view kWhite = " \t\n\v\f\r";

std::string_view bodyOf(std::string_view text) {
    const std::size_t marker = text.find(kMarker);
    if (marker == std::string_view::npos) return {};
    const std::string_view body = text.substr(marker + kMarker.size());
    return body.substr(0, body.find("CfgVer="));
}

std::vector<std::string_view> wordsOf(std::string_view body) {
    std::vector<std::string_view> words;
    for (std::size_t at = body.find_first_not_of(kWhite); at != std::string_view::npos;
         at = body.find_first_not_of(kWhite, at)) {
        const std::size_t end = std::min(body.find_first_of(kWhite, at), body.size());
        words.push_back(body.substr(at, end - at));
        at = end;
    }
    return words;
}

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

std::optional<int> nodeOf(std::string_view word) {
    constexpr std::string_view kNode = "Node";
    const std::size_t colons = word.find("::");
    if (!word.starts_with(kNode) || colons == std::string_view::npos) return std::nullopt;
    const char* const end = word.data() + colons;
    int node = 0;
    const auto [stop, error] = std::from_chars(word.data() + kNode.size(), end, node);
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
        throw CommandError(ExitCode::Usage, fmt::format("'{}' is no KEY=VALUE: {}", text, why));
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
    for (const std::string_view word : wordsOf(bodyOf(text))) {
        if (word.starts_with(key) && word.substr(key.size()).starts_with('=')) {
            return std::string(word.substr(key.size() + 1));
        }
    }
    return std::nullopt;
}

std::vector<int> nodesOf(std::string_view text) {
    std::set<int> nodes;
    if (const auto node = itemOf(text, "defNodeId")) {
        nodes.insert(static_cast<int>(std::strtol(node->c_str(), nullptr, 0)));
    }
    for (const std::string_view word : wordsOf(bodyOf(text))) {
        if (const auto node = nodeOf(word)) nodes.insert(*node);
    }
    return {nodes.begin(), nodes.end()};
}

std::optional<std::string> nodeItemOf(std::string_view text, int node, std::string_view key) {
    const auto own = itemOf(text, fmt::format("Node{}::{}", node, key));
    return own ? own : itemOf(text, key);
}

std::string modelOf(std::string_view text, int node) {
    return nodeItemOf(text, node, "model").value_or("1");
}

}  // namespace cli
