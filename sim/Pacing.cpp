#include "sim/Pacing.h"

#include <limits>

namespace sim {
namespace {

/// A wake-up and a write take some 20 us; a thread with more of them would only run behind.
constexpr Nanos kShortestWait = std::chrono::microseconds(100);

}  // namespace

std::size_t groupOf(wire::LineRate rate) {
    const Nanos one = wire::timeOfCharacters(1, rate);
    if (one == Nanos(0)) return std::numeric_limits<std::size_t>::max();
    return static_cast<std::size_t>((kShortestWait + one - Nanos(1)) / one);
}

Nanos silenceBeforeReply(wire::Mode mode, wire::LineRate rate) {
    const bool kept = mode == wire::Mode::Rtu && rate.baud > 0;
    return kept ? wire::silenceBetweenFrames(rate) : Nanos(0);
}

}  // namespace sim
