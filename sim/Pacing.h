// How characters share the time of a line of a given speed. Pure: instants come in and go out.
#pragma once

#include <chrono>
#include <cstddef>

#include "wire/Bytes.h"
#include "wire/Times.h"

namespace sim {

using Clock = std::chrono::steady_clock;
using Instant = Clock::time_point;
using Nanos = std::chrono::nanoseconds;

inline constexpr Instant kNever = Instant::max();

/// How many characters travel together, 1..: one, unless a character takes less than 100 us; then
/// as few as take 100 us. Without a rate there is no limit.
std::size_t groupOf(wire::LineRate rate);

/// The silence that a slave keeps before it replies: in RTU the end of the request, in ASCII (where
/// CR LF is the end) and without a rate 0.
Nanos silenceBeforeReply(wire::Mode mode, wire::LineRate rate);

}  // namespace sim
