// Whose turn it is: a node answers one request after the other, and nodes do not wait for one
// another. Pure.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>

#include "sim/Pacing.h"
#include "wire/Bytes.h"

namespace sim {

/// A request without its check.
struct Request {
    wire::Bytes message;  ///< Node, function, data; at least the node.
    Instant at;           ///< When it had arrived; from begin(): when its node is free for it.

    std::uint8_t node() const { return message[0]; }
};

/// Threads: one at a time.
class Turns {
  public:
    void add(Request request);

    /// @return the oldest request whose node is free; the node is busy until end(). Nothing when
    /// all that wait have to wait on.
    std::optional<Request> begin();

    /// The node is done with the request that it began. @param at  Since when.
    void end(std::uint8_t node, Instant at);

    /// Whether the node is at work, or was still at that instant.
    bool busyAt(std::uint8_t node, Instant at) const;

    /// Requests that nobody has begun.
    std::size_t waiting() const { return waiting_.size(); }

  private:
    struct Node {
        bool busy = false;
        Instant freeSince{};
    };

    std::deque<Request> waiting_;
    std::array<Node, 256> nodes_{};
};

}  // namespace sim
