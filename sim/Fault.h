// Faults on demand: what shall go wrong with the next answers.
#pragma once

#include <cstdint>
#include <deque>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "wire/Bytes.h"

namespace sim {

/// One fault, or several that befall the same answer: every member that is set applies.
/// `Fault{.times = 3, .silent = true}` keeps quiet for three requests.
struct Fault {
    int times = 1;          ///< Requests that it befalls, 1..; broadcasts do not count.
    std::uint8_t node = 0;  ///< Befalls requests to this node only; 0: to any.

    bool silent = false;         ///< The request is neither executed nor answered.
    std::uint8_t exception = 0;  ///< Not executed; answered with this exception code (not 0).

    // The request is executed, its reply suffers:
    bool wrongNode = false;             ///< The node is one too high, the check is right.
    bool wrongCheck = false;            ///< All bits of CRC or LRC are inverted.
    std::optional<std::size_t> keep{};  ///< Only so many bytes (characters) are sent; 0: lost.
    std::optional<wire::Bytes> replacement{};  ///< Sent as it is instead of the reply's frame.
    wire::Bytes noise{};                       ///< Bytes on the line right before the reply.
    std::uint32_t delayMs = 0;                 ///< Wait before the first byte.
    std::size_t dripBytes = 0;                 ///< Sent in pieces of so many bytes; 0: in one.
    std::uint32_t dripGapMs = 0;               ///< Wait between two pieces.
    bool hangUp = false;  ///< Then (after `keep` bytes, or none) the line dies.

    bool operator==(const Fault&) const = default;
};

/// Reads the form in which people write a fault: parts joined by commas,
/// "silent", "exception=2", "node" (wrong node), "check" (wrong check), "keep=5", "send=0103FF",
/// "noise=00FF", "delay=200", "drip=1/50" (bytes / ms), "hangup", "times=3", "for=7" (node).
/// @return nothing when a part is unknown, incomplete or out of range; `error` then says which.
std::optional<Fault> parseFault(std::string_view text, std::string& error);

/// How a reply goes out.
struct Transmission {
    wire::Bytes bytes;
    std::uint32_t delayMs = 0;
    std::size_t dripBytes = 0;  ///< 0: all in one piece.
    std::uint32_t dripGapMs = 0;
    bool hangUp = false;
};

/// Frames a reply, spoilt as the fault says. `silent` and `exception` are not looked at: they
/// decide before there is a reply. With hangUp and without `keep` there are no bytes.
Transmission transmit(wire::Mode mode, wire::ByteView reply, const Fault& fault);

/// The faults that wait for their requests; they come due in the order of their arrival.
/// Threads: any thread may call.
class FaultQueue {
  public:
    void add(Fault fault);
    /// @return the first fault that befalls a request to `node`, counted down; nothing without one.
    std::optional<Fault> take(std::uint8_t node);
    void clear();
    bool empty() const;

  private:
    mutable std::mutex mutex_;
    std::deque<Fault> faults_;
};

}  // namespace sim
