// How long a node takes before it replies. Pure: no clock, and what is random comes from a seed.
#pragma once

#include <cstdint>

#include "sim/Pacing.h"

namespace sim {

/// From the last character of a request to the first of its reply.
struct Turnaround {
    Nanos least{0};   ///< 0..
    Nanos most{0};    ///< The jitter's or the growth's end; below `least`: the same as `least`.
    Nanos growth{0};  ///< Added with every reply; 0: any time from `least` to `most` instead.

    bool operator==(const Turnaround&) const = default;
};

/// The turnarounds of one node, reply by reply; the same seed gives the same ones.
class Turnarounds {
  public:
    explicit Turnarounds(const Turnaround& turnaround, std::uint64_t seed = 1);

    Nanos next();

  private:
    Turnaround turnaround_;
    Nanos grown_;
    std::uint64_t random_;
};

}  // namespace sim
