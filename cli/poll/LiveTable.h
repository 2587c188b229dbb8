// What the live table of polled tags looks like. Pure.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "cli/poll/ScreenCells.h"
#include "cli/poll/TableView.h"
#include "poll/Snapshot.h"

namespace cli {

/// One tag as it is shown.
struct TableRow {
    std::string name;
    std::string value{};  ///< The last one; empty: there never was one.
    std::string unit{};
    poll::Quality quality = poll::Quality::Never;
    std::string error{};                             ///< Shown instead of a value that is none.
    std::optional<std::chrono::milliseconds> age{};  ///< Of the value.
    std::vector<double> history{};                   ///< The last values, the oldest first.
};

/// Makes rows when they are looked at: lists may be much longer than screens.
class RowSource {
  public:
    virtual ~RowSource() = default;
    [[nodiscard]] virtual TableRow row(std::size_t tag) const = 0;
};

/// How many tags are in which state.
struct QualityCounts {
    std::size_t good = 0, stale = 0, bad = 0, never = 0;
};

struct TableContent {
    QualityCounts counts;
    std::vector<poll::NodeState> nodes;
    poll::LineState line;
    std::string notice{};  ///< What was told last, e.g. about a file that was not taken.
};

/// Widths that stay the same while a list is scrolled.
struct ListWidths {
    int name = 4;  ///< Columns of the longest one.
    int unit = 0;  ///< 0: no tag has one.
};

struct TableStyle {
    bool unicode = true;
    ListWidths widths;
};

/// The whole screen: counts, tags as far as there is room, nodes, line, and what the keys do. The
/// narrower the terminal, the fewer columns the tags have; mark, name and value are always there.
/// @param view  Told how many rows are seen.
/// @return at most size.rows lines of at most size.columns.
std::vector<ScreenLine> liveTable(const TableContent& content, const RowSource& rows,
                                  TableView& view, ScreenSize size, const TableStyle& style);

/// @return "0.3s", "12s", "5m", "3h", "2d": at most 4 columns up to 999 days.
std::string ageText(std::chrono::milliseconds age);

/// @return "good", "stale", "bad" or "never".
const char* qualityName(poll::Quality quality);

}  // namespace cli
