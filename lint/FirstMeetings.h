// Which of many stretches meets each of many others first. Pure; the time grows hardly faster than
// their number, however much they overlap.
#pragma once

#include <cstddef>
#include <optional>
#include <vector>

namespace lint {

/// From `begin` to `end`, which does not belong to it any more.
struct Stretch {
    long long begin;
    long long end;
    int kind;  ///< From 0.
};

/// Met by stretches of every kind.
inline constexpr int kNoKind = -1;

/// @return for each of `seekers` the place in `others` of the first that shares a point with it and
/// is of another kind; nothing where there is none.
std::vector<std::optional<std::size_t>> firstMeetings(const std::vector<Stretch>& seekers,
                                                      const std::vector<Stretch>& others);

}  // namespace lint
