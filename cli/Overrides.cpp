#include "cli/Overrides.h"

#include <fmt/format.h>

#include <charconv>
#include <sstream>

#include "cli/Bytes.h"
#include "cli/ConfigText.h"
#include "cli/ValueTypes.h"

namespace cli {
namespace {

constexpr std::string_view kModiconTail = "_ModiconMode";

std::string nodeUri(int node) {
    return fmt::format("{}?NO?0?unsignedByte", node);
}
std::string modiconUri(int node) {
    return fmt::format("{}?NP_Mode?0?boolean", node);
}
// The line is everybody's: any node number reaches its settings.
std::string serialUri(const SerialSetting& setting) {
    return fmt::format("1?{}?0?{}", setting.area, setting.type);
}

std::string modiconKey(int node) {
    return fmt::format("node{}{}", node, kModiconTail);
}

/// @return the node of a key like node5_ModiconMode, or -1.
int nodeOfModiconKey(std::string_view key) {
    if (!key.starts_with("node") || !key.ends_with(kModiconTail)) return -1;
    key.remove_prefix(4);
    key.remove_suffix(kModiconTail.size());
    int node = -1;
    const auto [stop, error] = std::from_chars(key.data(), key.data() + key.size(), node);
    return error == std::errc{} && stop == key.data() + key.size() ? node : -1;
}

/// Reads the console's lines "id 5 -> 7".
void addConfiguredNodes(const std::string& answer, std::set<int>& nodes) {
    std::istringstream lines(answer);
    std::string line;
    while (std::getline(lines, line)) {
        std::istringstream words(line);
        std::string id;
        int node = 0;
        if (words >> id >> node && id == "id") nodes.insert(node);
    }
}

}  // namespace

std::uint32_t Overrides::read(const std::string& uri) {
    runtime::Channel& channel = session_.channel();
    const auto tag = channel.createTag(uri);
    if (!tag) throw CommandError(ExitCode::Other, tag.error().text);
    const auto value = channel.read(*tag.value());
    channel.freeTag(tag.value());
    if (!value) throw CommandError(ExitCode::Other, uri + ": " + value.error().text);
    return static_cast<std::uint32_t>(fromLittleEndian(value.value()));
}

void Overrides::write(const std::string& uri, std::uint32_t value, std::size_t bytes) {
    runtime::Channel& channel = session_.channel();
    const auto tag = channel.createTag(uri);
    if (!tag) throw CommandError(ExitCode::Other, tag.error().text);
    Bytes data;
    appendLittleEndian(data, value, bytes);
    const auto done = channel.write(*tag.value(), data);
    channel.freeTag(tag.value());
    // Special areas refuse without a text of their own.
    if (!done) throw CommandError(ExitCode::Other, fmt::format("{} refused {}", uri, value));
}

std::uint32_t Overrides::address(int node) {
    return read(nodeUri(node));
}
bool Overrides::modicon(int node) {
    return read(modiconUri(node)) != 0;
}
std::uint32_t Overrides::serial(const SerialSetting& setting) {
    return read(serialUri(setting));
}

void Overrides::setAddress(int node, std::uint8_t address) {
    write(nodeUri(node), address, 1);
}
void Overrides::setModicon(int node, bool on) {
    write(modiconUri(node), on ? 1 : 0, 1);
}

void Overrides::setSerial(const std::vector<SerialChange>& changes) {
    if (changes.empty()) return;
    for (const SerialChange& change : changes) {
        const std::size_t bytes = change.setting->type == "unsignedInt" ? 4 : 1;
        write(serialUri(*change.setting), change.code, bytes);
    }
    write("1?SP_Done?0?boolean", 1, 1);
}

std::set<int> Overrides::nodes() {
    std::set<int> nodes;
    for (const int node : nodesOf(session_.configText()))
        nodes.insert(node);
    addConfiguredNodes(session_.channel().command("getid").value_or(""), nodes);
    if (session_.storage() == nullptr) return nodes;
    for (const runtime::StoredEntry& entry : session_.storage()->entries(section())) {
        if (const int node = nodeOfModiconKey(entry.key); node >= 0) nodes.insert(node);
    }
    return nodes;
}

bool Overrides::storedAddress(int node) {
    return hasKey(fmt::format("tempNode{}", node));
}
bool Overrides::storedModicon(int node) {
    return hasKey(modiconKey(node));
}
bool Overrides::stored(const SerialSetting& setting) {
    return hasKey(std::string(setting.name));
}

void Overrides::forgetModicon(int node) {
    removeKey(modiconKey(node));
}
void Overrides::forget(const SerialSetting& setting) {
    removeKey(std::string(setting.name));
}

void Overrides::forgetAll() {
    if (session_.storage() == nullptr) return;
    for (const runtime::StoredEntry& entry : session_.storage()->entries(section())) {
        removeKey(entry.key);
    }
    for (const runtime::UnusedEntry& entry : session_.storage()->unused(section())) {
        removeKey(entry.key);
    }
}

bool Overrides::hasKey(const std::string& key) {
    runtime::Storage* const storage = session_.storage();
    return storage != nullptr && storage->hasKey(section(), key.c_str()) != 0;
}

void Overrides::removeKey(const std::string& key) {
    if (session_.storage() != nullptr) session_.storage()->removeKey(section(), key.c_str());
}

const char* Overrides::section() {
    return session_.channel().protocol().GetIdent();
}

}  // namespace cli
