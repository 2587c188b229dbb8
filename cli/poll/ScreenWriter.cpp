// Compares two screens and moves the cursor to where they differ.
#include "cli/poll/ScreenWriter.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>

namespace cli {
namespace {

struct StyleRow {
    CellStyle style;
    const char* colour;  ///< Parameters of "select graphic rendition". Source: ECMA-48, 8.3.117.
    const char* plain;   ///< The same without colours.
};

constexpr std::array kStyles{
    StyleRow{CellStyle::Plain, "0", "0"},      StyleRow{CellStyle::Title, "0;7", "0;7"},
    StyleRow{CellStyle::Dim, "0;2", "0;2"},    StyleRow{CellStyle::Good, "0;32", "0"},
    StyleRow{CellStyle::Warning, "0;33", "0"}, StyleRow{CellStyle::Bad, "0;31", "0;1"},
};

constexpr bool rowsMatchStyles() {
    for (std::size_t row = 0; row < kStyles.size(); ++row) {
        if (static_cast<std::size_t>(kStyles[row].style) != row) return false;
    }
    return true;
}
static_assert(kStyles.size() == static_cast<std::size_t>(CellStyle::Bad) + 1);
static_assert(rowsMatchStyles());

/// Going over that many equal cells is no longer than moving the cursor past them.
constexpr std::size_t kShortestMove = 6;

bool isBlank(const Cell& cell) {
    return cell == Cell{};
}

ScreenLine fullLine(const ScreenLine& line, std::size_t columns) {
    ScreenLine full = line;
    full.resize(columns);
    // A wide character whose second half is beyond the edge.
    if (line.size() > columns && line[columns].glyph.empty() && columns > 0)
        full.back().glyph = " ";
    return full;
}

}  // namespace

std::string ScreenWriter::enter() {
    return "\x1B[?1049h\x1B[?25l\x1B[?7l\x1B[0m\x1B[2J";
}

const char* ScreenWriter::leave() {
    return "\x1B[0m\x1B[?7h\x1B[?25h\x1B[?1049l";
}

void ScreenWriter::forget() {
    size_ = {0, 0};
}

std::string ScreenWriter::draw(const std::vector<ScreenLine>& lines, ScreenSize size) {
    std::string out;
    const auto columns = static_cast<std::size_t>(std::max(0, size.columns));
    const auto rows = static_cast<std::size_t>(std::max(0, size.rows));
    if (size != size_) {
        out = "\x1B[0m\x1B[2J";
        pen_ = CellStyle::Plain;
        shown_.assign(rows, ScreenLine(columns));
        size_ = size;
    }
    for (std::size_t row = 0; row < rows; ++row) {
        const ScreenLine line =
            row < lines.size() ? fullLine(lines[row], columns) : ScreenLine(columns);
        out += drawLine(static_cast<int>(row), line);
    }
    style(out, CellStyle::Plain);
    return out;
}

std::string ScreenWriter::drawLine(int row, const ScreenLine& line) {
    ScreenLine& old = shown_[static_cast<std::size_t>(row)];
    std::string out;
    const auto blankFrom = static_cast<std::size_t>(
        std::find_if_not(line.rbegin(), line.rend(), isBlank).base() - line.begin());
    std::size_t column = 0;
    std::size_t cursor = line.size() + 1;
    for (;;) {
        while (column < line.size() && line[column] == old[column])
            ++column;
        if (column == line.size()) break;
        while (column > 0 && line[column].glyph.empty())
            --column;
        if (cursor <= column && column - cursor < kShortestMove) column = cursor;
        if (cursor != column) move(out, row, column);
        if (column >= blankFrom) {
            style(out, CellStyle::Plain);
            out += "\x1B[K";
            break;
        }
        // The whole run up to the next equal cell; a character's second half belongs to it.
        do {
            style(out, line[column].style);
            out += line[column].glyph;
            ++column;
        } while (column < line.size() && (line[column].glyph.empty() ||
                                          (column < blankFrom && line[column] != old[column])));
        cursor = column;
    }
    old = line;
    return out;
}

void ScreenWriter::move(std::string& out, int row, std::size_t column) const {
    out += fmt::format("\x1B[{};{}H", row + 1, column + 1);
}

void ScreenWriter::style(std::string& out, CellStyle style) {
    if (style == pen_) return;
    const StyleRow& row = kStyles[static_cast<std::size_t>(style)];
    const StyleRow& old = kStyles[static_cast<std::size_t>(pen_)];
    pen_ = style;
    const std::string_view now = colour_ ? row.colour : row.plain;
    if (now != (colour_ ? old.colour : old.plain)) out += fmt::format("\x1B[{}m", now);
}

}  // namespace cli
