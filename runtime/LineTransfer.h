// How bytes leave over a serial line: every wait has one absolute deadline.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <span>

#include "runtime/Line.h"

namespace runtime {

using Milliseconds = std::chrono::milliseconds;

/// How a transfer ended.
enum class Transfer : std::uint8_t {
    Complete,  ///< The byte came; the frame ended; everything was sent.
    TimedOut,  ///< The deadline passed first.
    Gone,      ///< The line is no more.
};

/// Hands all of `data` to the line, which sends it by itself. When it does not take everything by
/// the deadline, what has not been sent is thrown away, so that no half frame leaves later.
Transfer sendAll(Line& line, std::span<const std::uint8_t> data, Line::TimePoint deadline);

/// Waits until the line has sent what it took; a line that can't tell has. What is left at the
/// deadline is thrown away.
Transfer drain(Line& line, Line::TimePoint deadline, std::chrono::nanoseconds characterTime);

/// The time that one character of `bits` bits (start, data, parity and stop bits) takes on the
/// wire, rounded up: who looks that much later finds it. REQUIRES: baud > 0.
constexpr std::chrono::nanoseconds characterTime(int baud, int bits) {
    return std::chrono::nanoseconds((std::int64_t{bits} * 1'000'000'000 + baud - 1) / baud);
}

/// How long sending may take: the characters' own time plus a margin for a busy system.
constexpr std::chrono::nanoseconds sendingTime(std::size_t length,
                                               std::chrono::nanoseconds character) {
    constexpr std::chrono::seconds kMargin{1};
    return character * static_cast<std::int64_t>(length) + kMargin;
}

}  // namespace runtime
