// Makes the storage's keys of overrides and takes them apart.
#include "cli/override/OverrideKeys.h"

#include <fmt/format.h>

#include <charconv>

#include "settings/NumberText.h"

namespace cli {
namespace {

constexpr std::string_view kAddressFront = "tempNode";
constexpr std::string_view kModiconFront = "node";
constexpr std::string_view kModiconTail = "_ModiconMode";

}  // namespace

std::string addressKey(int node) {
    return fmt::format("{}{}", kAddressFront, node);
}

std::optional<int> nodeOfAddressKey(std::string_view key) {
    const auto number = addressNumber(key);
    if (!number) return std::nullopt;
    return static_cast<int>(settings::readNumber(*number).value);
}

std::optional<std::string> addressNumber(std::string_view key) {
    if (!key.starts_with(kAddressFront)) return std::nullopt;
    return std::string(key.substr(kAddressFront.size()));
}

std::string modiconKey(int node) {
    return fmt::format("{}{}{}", kModiconFront, node, kModiconTail);
}

std::optional<int> nodeOfModiconKey(std::string_view key) {
    if (!isModiconKey(key)) return std::nullopt;
    key.remove_prefix(kModiconFront.size());
    key.remove_suffix(kModiconTail.size());
    int node = 0;
    const auto [stop, error] = std::from_chars(key.data(), key.data() + key.size(), node);
    if (error != std::errc{} || stop != key.data() + key.size()) return std::nullopt;
    return node;
}

bool isModiconKey(std::string_view key) {
    return key.size() >= kModiconFront.size() + kModiconTail.size() &&
           key.starts_with(kModiconFront) && key.ends_with(kModiconTail);
}

}  // namespace cli
