// The header line of a list of tags. Pure.
#pragma once

#include <vector>

#include "poll/TagCells.h"

namespace poll {

/// The columns of one list, from left to right; null for one that has no meaning.
struct ListHeader {
    std::vector<const ListColumn*> columns;

    [[nodiscard]] bool has(const ListColumn& column) const;
};

/// @param cells  Of the header line, one at least.
/// @return false when the lines below it can't be understood, which was complained of.
bool readHeader(const std::vector<CsvCell>& cells, ListHeader& header, Complaints& complaints);

}  // namespace poll
