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
        const bool added =
            memories_.try_emplace(node.address, node.address, node.sizes, node.longs).second;
        if (!added) {
            throw std::invalid_argument("node " + std::to_string(node.address) + " named twice");
        }
    }
}

std::optional<Bytes> Slave::answer(ByteView request) {
    if (request.size() < 2) return std::nullopt;
    const std::lock_guard lock(mutex_);
    if (request[0] == kBroadcast) {
        if (isWrite(request[1])) broadcast(request);
        return std::nullopt;
    }
    const auto found = memories_.find(request[0]);
    if (found == memories_.end()) return std::nullopt;
    Bytes reply = execute(found->second, request.subspan(1));
    reply.insert(reply.begin(), request[0]);
    return reply;
}

void Slave::broadcast(ByteView request) {
    // A node that cannot execute the request has nobody to tell.
    for (auto& [node, memory] : memories_)
        execute(memory, request.subspan(1));
}

std::optional<std::size_t> Slave::requestLength(ByteView firstBytes) const {
    const auto address = wire::addressOfRequest(firstBytes);
    if (!address) return std::nullopt;
    return wire::lengthOfRequest(firstBytes, isLong(firstBytes[0], *address));
}

bool Slave::isLong(std::uint8_t node, std::uint16_t address) const {
    // No lock: the set of nodes and their ranges never change.
    return std::any_of(memories_.begin(), memories_.end(), [&](const auto& entry) {
        const auto& longs = entry.second.longs();
        return (node == kBroadcast || node == entry.first) && longs && longs->contains(address);
    });
}

std::uint32_t Slave::get(std::uint8_t node, Area area, std::uint32_t address) const {
    const std::lock_guard lock(mutex_);
    const Memory& memory = memories_.at(node);
    requireItem(memory, area, address);
    return memory.get(area, address);
}

void Slave::set(std::uint8_t node, Area area, std::uint32_t address, std::uint32_t value) {
    const std::lock_guard lock(mutex_);
    Memory& memory = memories_.at(node);
    requireItem(memory, area, address);
    memory.set(area, address, value);
}

}  // namespace sim
