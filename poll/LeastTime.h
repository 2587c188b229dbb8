// The grouping of tags into reads that takes the least time. Pure.
#pragma once

#include <cstddef>
#include <span>
#include <vector>

#include "poll/ReadCost.h"

namespace poll {

/// The items of an area that something stands for, `end` excluded.
struct Extent {
    long first;  ///< 0..
    long end;

    [[nodiscard]] long items() const { return end - first; }
    [[nodiscard]] bool contains(const Extent& other) const {
        return first <= other.first && other.end <= end;
    }
};

/// Groups extents into reads of at most `most` items so that the sum of the reads' costs is the
/// least that any grouping has.
///
/// Only groupings into runs of neighbours are looked at, and that suffices: take any grouping and
/// the interval that each of its reads covers. An interval inside another is not needed, since the
/// other brings its items, too. Of those that are left none contains another, so they end in the
/// order in which they begin. Now hand each extent to the last interval that begins at or in front
/// of it. The one that held it begins no later, so it ends no later, and the extent fits. Extents
/// in the order of their beginnings are thereby handed out in runs, no interval has grown, and a
/// read costs no more when its interval shrinks: the grouping into runs costs no more than the one
/// that was taken.
///
/// What is left is a shortest path over the places where a run can begin. A read's cost grows by
/// the same with each unit, so that of all possible beginnings with the same place inside a unit
/// the same one stays the best until it is out of a request's reach: time grows with the number of
/// extents, whatever lies between them.
///
/// @param extents  Sorted; each begins and ends behind the one before it. None has more than `most`
/// items.
/// @return the indices at which the reads begin, ascending. Of groupings with equal cost one with
/// long reads.
std::vector<std::size_t> leastTime(std::span<const Extent> extents, const ReadCost& cost,
                                   long most);

}  // namespace poll
