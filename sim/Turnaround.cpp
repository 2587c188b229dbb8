#include "sim/Turnaround.h"

#include <algorithm>
#include <utility>

namespace sim {
namespace {

/// SplitMix64: a few lines that give the same numbers with every library. Source: Steele, Lea and
/// Flood, "Fast Splittable Pseudorandom Number Generators", 2014.
std::uint64_t nextRandom(std::uint64_t& state) {
    state += 0x9E3779B97F4A7C15U;
    std::uint64_t bits = state;
    bits = (bits ^ (bits >> 30U)) * 0xBF58476D1CE4E5B9U;
    bits = (bits ^ (bits >> 27U)) * 0x94D049BB133111EBU;
    return bits ^ (bits >> 31U);
}

}  // namespace

Turnarounds::Turnarounds(const Turnaround& turnaround, std::uint64_t seed)
    : turnaround_(turnaround), grown_(turnaround.least), random_(seed) {
    turnaround_.most = std::max(turnaround.most, turnaround.least);
}

Nanos Turnarounds::next() {
    if (turnaround_.growth != Nanos(0)) {
        const Nanos grown = std::min(grown_ + turnaround_.growth, turnaround_.most);
        return std::exchange(grown_, grown);
    }
    const auto span = static_cast<std::uint64_t>((turnaround_.most - turnaround_.least).count());
    const std::uint64_t extra = nextRandom(random_) % (span + 1);
    return turnaround_.least + Nanos(static_cast<Nanos::rep>(extra));
}

}  // namespace sim
