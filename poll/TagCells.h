// What the cells of a list of tags may hold, column by column. Pure.
#pragma once

#include <array>
#include <string>
#include <string_view>

#include "poll/CsvReader.h"

namespace poll {

/// Puts a cell that is not empty into the tag, or complains and leaves the tag as it is.
using TakeCell = void (*)(ListedTag& tag, const CsvCell& cell, Complaints& complaints);

struct ListColumn {
    std::string_view name;
    TakeCell take;
    int CellColumns::*place = nullptr;  ///< Where the place of the cell is kept; null: nowhere.
    const char* emptyRule = nullptr;    ///< Broken by an empty cell; null: it may be empty.
};

/// The columns that a list may have; the first two it must have.
extern const std::array<ListColumn, 10> kListColumns;
inline constexpr std::size_t kNeededColumns = 2;

/// @return "name, uri, period, ...": for complaints.
std::string listColumnNames();

}  // namespace poll
