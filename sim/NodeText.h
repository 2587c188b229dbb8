// The form in which people write how nodes behave. Pure.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "sim/Memory.h"
#include "sim/Presence.h"
#include "sim/Turnaround.h"

namespace sim {

/// A behaviour and whose it is: "3:..." means node 3, a text without a node means all of them.
template <typename Behaviour>
struct ForNodes {
    std::optional<std::uint8_t> node{};
    Behaviour behaviour{};

    bool operator==(const ForNodes&) const = default;
};

/// Each reads a whole text, a node 1..255 in front or not. @return nothing when the text is
/// malformed or out of range; `error` then says what it may be.

/// "20" (ms), "20..60" (any time between), "20+5" (5 ms more with every reply), "20+5..200" (at
/// most 200); up to an hour, with up to three digits behind a point.
std::optional<ForNodes<Turnaround>> parseTurnaround(std::string_view text, std::string& error);

/// "10/5": there for 10 s, then away for 5 s, and so on; up to an hour each, not both 0, with up to
/// three digits behind a point.
std::optional<ForNodes<Presence>> parsePresence(std::string_view text, std::string& error);

/// "HREG:100-199" or "HREG:100": the area as in tags (OUTP, INP, HREG, IREG), addresses from 0 to
/// 65535 as on the line.
std::optional<ForNodes<RefusedRange>> parseRefusedRange(std::string_view text, std::string& error);

}  // namespace sim
