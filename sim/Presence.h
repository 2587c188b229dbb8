// When a node is there. Pure: the time comes in.
#pragma once

#include "sim/Pacing.h"

namespace sim {

/// A node that is away neither hears nor answers, as if its plug were pulled; its memory stays.
/// With an absence of 0 it is always there, with a presence of 0 and an absence it is dead; else it
/// comes and goes, beginning with its presence.
struct Presence {
    Nanos there{0};
    Nanos away{0};

    /// @param sinceStart  From the moment at which the line began to be served, 0..
    bool at(Nanos sinceStart) const;

    bool operator==(const Presence&) const = default;
};

/// A node that never answers.
inline constexpr Presence kDead{.there = Nanos(0), .away = Nanos(1)};

}  // namespace sim
