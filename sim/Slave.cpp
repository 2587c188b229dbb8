#include "sim/Slave.h"

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>

#include "sim/Functions.h"
#include "wire/Lengths.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::ByteView;

constexpr std::uint8_t kBroadcast = 0;

void requireItem(const Memory& memory, Area area, std::uint32_t address) {
    if (!memory.has(area, address, 1)) {
        throw std::out_of_range("no item at address " + std::to_string(address));
    }
}

}  // namespace

Slave::Slave(const std::vector<NodeOptions>& nodes) {
    for (const NodeOptions& node : nodes) {
        if (node.address == kBroadcast) throw std::invalid_argument("node 0 is broadcast");
        Memory memory(node.address, node.sizes, node.longs, node.refused);
        const bool added =
            nodes_.try_emplace(node.address, Node{std::move(memory), node.presence}).second;
        if (!added) {
            throw std::invalid_argument("node " + std::to_string(node.address) + " named twice");
        }
    }
}

std::optional<Bytes> Slave::answer(ByteView request, Nanos sinceStart) {
    if (request.size() < 2) return std::nullopt;
    const std::lock_guard lock(mutex_);
    if (request[0] == kBroadcast) {
        if (isWrite(request[1])) broadcast(request, sinceStart);
        return std::nullopt;
    }
    const auto found = nodes_.find(request[0]);
    if (found == nodes_.end() || !found->second.presence.at(sinceStart)) return std::nullopt;
    Bytes reply = execute(found->second.memory, request.subspan(1));
    reply.insert(reply.begin(), request[0]);
    return reply;
}

void Slave::broadcast(ByteView request, Nanos sinceStart) {
    // A node that cannot execute the request has nobody to tell.
    for (auto& [address, node] : nodes_)
        if (node.presence.at(sinceStart)) execute(node.memory, request.subspan(1));
}

bool Slave::isThere(std::uint8_t node, Nanos sinceStart) const {
    const std::lock_guard lock(mutex_);
    const auto found = nodes_.find(node);
    return found != nodes_.end() && found->second.presence.at(sinceStart);
}

void Slave::setPresence(std::uint8_t node, const Presence& presence) {
    const std::lock_guard lock(mutex_);
    nodes_.at(node).presence = presence;
}

std::optional<std::size_t> Slave::requestLength(ByteView firstBytes) const {
    const auto address = wire::addressOfRequest(firstBytes);
    if (!address) return std::nullopt;
    return wire::lengthOfRequest(firstBytes, isLong(firstBytes[0], *address));
}

bool Slave::isLong(std::uint8_t node, std::uint16_t address) const {
    // No lock: the set of nodes and their ranges never change.
    return std::any_of(nodes_.begin(), nodes_.end(), [&](const auto& entry) {
        const auto& longs = entry.second.memory.longs();
        return (node == kBroadcast || node == entry.first) && longs && longs->contains(address);
    });
}

std::uint32_t Slave::get(std::uint8_t node, Area area, std::uint32_t address) const {
    const std::lock_guard lock(mutex_);
    const Memory& memory = nodes_.at(node).memory;
    requireItem(memory, area, address);
    return memory.get(area, address);
}

void Slave::set(std::uint8_t node, Area area, std::uint32_t address, std::uint32_t value) {
    const std::lock_guard lock(mutex_);
    Memory& memory = nodes_.at(node).memory;
    requireItem(memory, area, address);
    memory.set(area, address, value);
}

}  // namespace sim
