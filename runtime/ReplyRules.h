// What a serial port asks about the bytes that pass through it, so that it needs no protocol.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace runtime {

using ByteView = std::span<const std::uint8_t>;

/// Whether a received frame answers a request.
enum class Answer : std::uint8_t {
    No,
    Damaged,  ///< As long as the reply would be, but its check is wrong.
    Yes,      ///< By everything that the two frames tell.
};

/// Knowledge of one protocol's requests and replies. Frames are as they travel, check included.
/// REQUIRES: a request that has no addressee is asked for that and for its silence alone.
/// Threads: any; an object has no state.
class ReplyRules {
  public:
    virtual ~ReplyRules() = default;

    /// @return the device that answers; nothing where nobody does (a broadcast) and for bytes that
    /// are no request.
    virtual std::optional<std::uint8_t> addressee(ByteView request) const = 0;

    /// @param received  What has come of the reply so far, also nothing.
    /// @return the fewest bytes that the whole reply can have; 0 when that can't be told.
    virtual std::size_t replyLength(ByteView request, ByteView received) const = 0;

    /// @return whether the bytes are a whole reply to the request, so that nothing can follow.
    virtual bool isWhole(ByteView request, ByteView received) const = 0;

    virtual Answer answers(ByteView request, ByteView frame) const = 0;

    /// @return whether a good reply to the one could be a good reply to the other. Error replies do
    /// not count.
    virtual bool confusable(ByteView one, ByteView other) const = 0;

    /// @param characterBits  Start, data, parity and stop bits.
    /// @return how long the line must be silent between the reply to `request` and what is sent
    /// next.
    virtual std::chrono::nanoseconds silence(ByteView request, int baud,
                                             int characterBits) const = 0;
};

}  // namespace runtime
