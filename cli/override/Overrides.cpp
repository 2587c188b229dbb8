// Reads and writes overrides through the driver's own memory areas.
#include "cli/override/Overrides.h"

#include <fmt/format.h>

#include <sstream>

#include "cli/override/OverrideKeys.h"
#include "settings/ConfigText.h"
#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace cli {
namespace {

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
    return static_cast<std::uint32_t>(values::fromLittleEndian(value.value()));
}

void Overrides::write(const std::string& uri, std::uint32_t value, std::size_t bytes) {
    runtime::Channel& channel = session_.channel();
    const auto tag = channel.createTag(uri);
    if (!tag) throw CommandError(ExitCode::Other, tag.error().text);
    values::Bytes data;
    values::appendLittleEndian(data, value, bytes);
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
    for (const int node : settings::nodesOf(session_.configText()))
        nodes.insert(node);
    addConfiguredNodes(session_.channel().command("getid").value_or(""), nodes);
    if (session_.storage() == nullptr) return nodes;
    for (const runtime::StoredEntry& entry : session_.storage()->entries(section())) {
        if (const auto node = nodeOfModiconKey(entry.key)) nodes.insert(*node);
    }
    return nodes;
}

bool Overrides::storesAddress(int node, std::uint32_t address) {
    return storesNumber(addressKey(node), static_cast<int>(address));
}
bool Overrides::storesModicon(int node, bool on) {
    const std::string key = modiconKey(node);
    return hasKey(key) && session_.storage()->readBool(section(), key.c_str()) == on;
}
bool Overrides::stores(const SerialSetting& setting, std::uint32_t code) {
    return storesNumber(std::string(setting.name), static_cast<int>(code));
}

void Overrides::forgetAddress(int node) {
    for (const std::string& key : keys()) {
        if (nodeOfAddressKey(key) == node) removeKey(key);
    }
}
void Overrides::forgetModicon(int node) {
    removeKey(modiconKey(node));
}
void Overrides::forget(const SerialSetting& setting) {
    removeKey(std::string(setting.name));
}

void Overrides::forgetAll() {
    for (const std::string& key : keys())
        removeKey(key);
}

// Of what is in force and of what is there and not used.
std::vector<std::string> Overrides::keys() {
    std::vector<std::string> keys;
    if (session_.storage() == nullptr) return keys;
    for (const runtime::StoredEntry& entry : session_.storage()->entries(section()))
        keys.push_back(entry.key);
    for (const runtime::UnusedEntry& entry : session_.storage()->unused(section()))
        keys.push_back(entry.key);
    return keys;
}

bool Overrides::hasKey(const std::string& key) {
    runtime::Storage* const storage = session_.storage();
    return storage != nullptr && storage->hasKey(section(), key.c_str()) != 0;
}

bool Overrides::storesNumber(const std::string& key, int number) {
    return hasKey(key) && session_.storage()->readInt(section(), key.c_str()) == number;
}

void Overrides::removeKey(const std::string& key) {
    if (session_.storage() != nullptr) session_.storage()->removeKey(section(), key.c_str());
}

const char* Overrides::section() {
    return session_.channel().protocol().GetIdent();
}

}  // namespace cli
