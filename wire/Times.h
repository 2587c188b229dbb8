// How long characters and silences take on a serial line. Pure. Nothing is rounded down: who waits
// for one of these times never waits too short.
// Source of the silences: Modbus over Serial Line V1.02, 2.5.1.1.
#pragma once

#include <chrono>
#include <cstdint>
#include <limits>

#include "wire/Bytes.h"

namespace wire {

/// Start, data, parity (or a second stop) and stop bit. Source: the same, 2.5.1 and 2.5.2.
constexpr int standardCharacterBits(Mode mode) {
    return mode == Mode::Rtu ? 1 + 8 + 1 + 1 : 1 + 7 + 1 + 1;
}

/// The speed of a line.
struct LineRate {
    int baud;
    /// Start, data, parity and stop bits of a character, 1..
    int characterBits = standardCharacterBits(Mode::Rtu);
};

/// The time of `halves` half characters; the longest time that there is when it is longer still.
/// A line without a rate (0 baud and below) takes no time.
constexpr std::chrono::nanoseconds timeOfHalfCharacters(std::uint64_t halves, LineRate rate) {
    using std::chrono::nanoseconds;
    constexpr std::uint64_t kSecond = 1'000'000'000;
    constexpr auto kLongest = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
    if (rate.baud <= 0 || rate.characterBits <= 0) return nanoseconds{0};
    const auto bits = static_cast<std::uint64_t>(rate.characterBits);
    if (halves > kLongest / bits) return nanoseconds::max();
    const std::uint64_t halfBits = halves * bits;
    const std::uint64_t aSecond = 2 * static_cast<std::uint64_t>(rate.baud);
    const std::uint64_t seconds = halfBits / aSecond;
    // Whole seconds are split off first, so that the product stays below 2^62.
    const std::uint64_t rest = (halfBits % aSecond * kSecond + aSecond - 1) / aSecond;
    if (seconds > (kLongest - rest) / kSecond) return nanoseconds::max();
    return nanoseconds(static_cast<std::int64_t>(seconds * kSecond + rest));
}

/// The time of `count` characters that follow one another without a pause.
constexpr std::chrono::nanoseconds timeOfCharacters(std::uint64_t count, LineRate rate) {
    if (count > std::numeric_limits<std::uint64_t>::max() / 2)
        return std::chrono::nanoseconds::max();
    return timeOfHalfCharacters(2 * count, rate);
}

/// Above it the silences are no longer shorter.
inline constexpr int kFastestScaledBaud = 19200;

/// The silence between two RTU frames, at least: 3.5 characters, 1.75 ms on a fast line.
constexpr std::chrono::nanoseconds silenceBetweenFrames(LineRate rate) {
    if (rate.baud > kFastestScaledBaud) return std::chrono::microseconds{1750};
    return timeOfHalfCharacters(3 * 2 + 1, rate);
}

/// The pause between two characters of one RTU frame, at most: 1.5 characters, 0.75 ms on a fast
/// line.
constexpr std::chrono::nanoseconds longestPauseInFrame(LineRate rate) {
    if (rate.baud > kFastestScaledBaud) return std::chrono::microseconds{750};
    return timeOfHalfCharacters(1 * 2 + 1, rate);
}

}  // namespace wire
