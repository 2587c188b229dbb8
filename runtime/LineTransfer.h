// How bytes and frames travel over a serial line: every wait has one absolute deadline.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <span>

#include "runtime/Line.h"

namespace runtime {

using Milliseconds = std::chrono::milliseconds;

/// How a transfer ended.
enum class Transfer {
    Complete,  ///< The byte came; the frame ended; everything was sent.
    TimedOut,  ///< The deadline passed first.
    Gone,      ///< The line is no more.
};

/// Waits for one byte.
/// @param byte  Receives it; untouched unless Complete.
/// @param timeout  From the call; 0 and below only look.
Transfer receiveOne(Line& line, std::uint8_t& byte, Milliseconds timeout);

/// What receiveRest() found.
struct FrameEnd {
    Transfer how;       ///< Complete: ended by silence or by its maximum.
    std::size_t count;  ///< Bytes stored, whatever the end was.
};

/// Reads until the line has been silent for `gap`, the buffer is full or `timeout` has passed
/// since the call, whichever is first. Silence counts from the call and from every piece that
/// arrives; arriving bytes never move the deadline.
FrameEnd receiveRest(Line& line, std::span<std::uint8_t> buffer, Milliseconds timeout,
                     Milliseconds gap);

/// Writes all of `data` and waits until it is on the wire. When that can't be done by the deadline,
/// what has not been sent is thrown away, so that no half frame leaves later.
/// @param allowed  From the call; see sendingTime().
Transfer sendAll(Line& line, std::span<const std::uint8_t> data, std::chrono::nanoseconds allowed,
                 std::chrono::nanoseconds characterTime);

/// The time that one character of `bits` bits (start, data, parity and stop bits) takes on the
/// wire. REQUIRES: baud > 0.
constexpr std::chrono::nanoseconds characterTime(int baud, int bits) {
    return std::chrono::nanoseconds(std::int64_t{bits} * 1'000'000'000 / baud);
}

/// How long sending may take: the characters' own time plus a margin for a busy system.
constexpr std::chrono::nanoseconds sendingTime(std::size_t length,
                                               std::chrono::nanoseconds character) {
    constexpr std::chrono::seconds kMargin{1};
    return character * static_cast<std::int64_t>(length) + kMargin;
}

}  // namespace runtime
