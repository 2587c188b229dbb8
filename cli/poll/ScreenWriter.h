// The bytes that turn what a terminal shows into what it is to show. Pure.
#pragma once

#include <string>
#include <vector>

#include "cli/poll/ScreenCells.h"

namespace cli {

/// Remembers what the terminal shows. Control sequences are those of ECMA-48 and of xterm's
/// alternate screen.
class ScreenWriter {
  public:
    /// @param colour  false: no colours, only bold and reversed text.
    explicit ScreenWriter(bool colour) : colour_(colour) {}

    /// @return what takes the whole screen; the user's own text comes back with leave(). Lines do
    /// not wrap meanwhile, so that the last column of the last line scrolls nothing.
    [[nodiscard]] static std::string enter();
    /// @return what gives the screen back; harmless when it was never taken.
    [[nodiscard]] static const char* leave();

    /// @param lines  Those beyond the size are left out; missing ones are blank.
    /// @return what changes the screen, empty when nothing changed. It must be written as a whole.
    std::string draw(const std::vector<ScreenLine>& lines, ScreenSize size);

    /// Something else has written on the screen: the next draw() begins anew.
    void forget();

  private:
    std::string drawLine(int row, const ScreenLine& line);
    void move(std::string& out, int row, std::size_t column) const;
    void style(std::string& out, CellStyle style);

    bool colour_;
    ScreenSize size_{0, 0};
    std::vector<ScreenLine> shown_;
    CellStyle pen_ = CellStyle::Plain;
};

}  // namespace cli
