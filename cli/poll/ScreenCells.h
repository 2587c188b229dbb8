// Text as the columns of a terminal. Pure.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace cli {

enum class CellStyle : std::uint8_t { Plain, Title, Dim, Good, Warning, Bad };

/// What stands in one column.
struct Cell {
    /// One character with what combines with it, as UTF-8; empty in the column behind the first of
    /// a character that is two columns wide.
    std::string glyph = " ";
    CellStyle style = CellStyle::Plain;
    bool operator==(const Cell&) const = default;
};

using ScreenLine = std::vector<Cell>;

struct ScreenSize {
    int columns = 80;
    int rows = 24;
    bool operator==(const ScreenSize&) const = default;
};

enum class Align : std::uint8_t { Left, Right };

/// Makes one line that is at most `columns` wide. Names come out of files that anybody may have
/// written: control characters, also those that turn the direction of writing, and bytes that are
/// no UTF-8 become "?".
class LineBuilder {
  public:
    /// @param unicode  Whether the terminal shows more than ASCII; what it can't becomes "?".
    LineBuilder(int columns, bool unicode);

    /// Appends text as far as the line has room.
    LineBuilder& put(std::string_view text, CellStyle style = CellStyle::Plain);
    /// Appends exactly `width` columns: filled with blanks, or cut and marked as cut.
    LineBuilder& putFitted(std::string_view text, int width, CellStyle style = CellStyle::Plain,
                           Align align = Align::Left);
    /// @return the columns that are left.
    [[nodiscard]] int room() const;
    /// @return the line; the builder is empty then.
    ScreenLine take();

  private:
    int columns_;
    bool unicode_;
    ScreenLine line_;
};

/// @return the columns that the text takes in a LineBuilder with unlimited room.
int columnsOf(std::string_view text, bool unicode);

/// @return the glyphs of the line without their styles, blanks at its end left out.
std::string textOf(const ScreenLine& line);

}  // namespace cli
