// The nodes of one line: requests in, replies out. Pure: no port, no clock.
#pragma once

#include <cstdint>
#include <map>
#include <mutex>
#include <optional>
#include <vector>

#include "sim/Memory.h"
#include "sim/Presence.h"
#include "sim/Turnaround.h"
#include "wire/Bytes.h"

namespace sim {

/// A node on the line.
struct NodeOptions {
    std::uint8_t address = 1;  ///< 1..255; the standard assigns 1..247.
    AreaSizes sizes{};
    std::optional<LongRange> longs{};     ///< Set: the node has Enron 32-bit registers.
    std::vector<RefusedRange> refused{};  ///< Answered with exception 2.
    Presence presence{};
    Turnaround turnaround{};  ///< Kept by the Simulator.
};

/// Serves functions 1 to 6, 15 and 16 as Modbus Application Protocol V1.1b3, 6 lays down: function,
/// then value (count, byte count, length), then address are checked. A message of the wrong length
/// gets exception 3. Node 0 is broadcast: every node executes a write, nobody answers.
///
/// Enron: function 3 counts in 32-bit registers (at most 62, 4 bytes each), function 6 carries one
/// of them (4 bytes) and is echoed whole; most significant byte first. A read may not cross the
/// range's bounds.
/// Threads: any thread may call; a request is one step for all others.
class Slave {
  public:
    /// Errors: std::invalid_argument for node 0, a node named twice or impossible sizes.
    explicit Slave(const std::vector<NodeOptions>& nodes);

    /// Executes a message without its check.
    /// @param sinceStart  For the nodes that come and go, see Presence.
    /// @return the reply without its check; nothing for a broadcast, a node that is not on this
    /// line or away, or a message of fewer than 2 bytes.
    std::optional<wire::Bytes> answer(wire::ByteView request, Nanos sinceStart = Nanos(0));

    /// See RequestLength in wire/Framing.h. A broadcast of function 6 counts as 32-bit when any
    /// node has a 32-bit register of that address.
    std::optional<std::size_t> requestLength(wire::ByteView firstBytes) const;

    bool hasNode(std::uint8_t node) const { return nodes_.count(node) != 0; }

    /// Whether the node is on this line and there.
    bool isThere(std::uint8_t node, Nanos sinceStart) const;

    /// Errors: std::out_of_range when there is no such node.
    void setPresence(std::uint8_t node, const Presence& presence);

    /// An item of a node's memory, read-only areas included.
    /// Errors: std::out_of_range when there is no such node or item.
    std::uint32_t get(std::uint8_t node, Area area, std::uint32_t address) const;
    void set(std::uint8_t node, Area area, std::uint32_t address, std::uint32_t value);

  private:
    struct Node {
        Memory memory;
        Presence presence;
    };

    void broadcast(wire::ByteView request, Nanos sinceStart);
    bool isLong(std::uint8_t node, std::uint16_t address) const;

    mutable std::mutex mutex_;
    std::map<std::uint8_t, Node> nodes_;
};

}  // namespace sim
