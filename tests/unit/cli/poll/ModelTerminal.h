// A terminal that understands what the live table sends, and nothing else.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "cli/poll/ScreenCells.h"

namespace cli_test {

class ModelTerminal {
  public:
    explicit ModelTerminal(cli::ScreenSize size);

    /// Shows the bytes. Fails the test on a sequence that it does not know, a cursor off the screen
    /// and a character behind the last column.
    void show(std::string_view bytes);
    /// The user changes the size; what stood there is reflowed in ways that nobody knows.
    void resize(cli::ScreenSize size);

    /// @return what stands in a line, blanks at its end left out.
    [[nodiscard]] std::string line(int row) const;
    /// @return "31" for red, "" for plain.
    [[nodiscard]] std::string styleAt(int row, int column) const;

  private:
    struct Place {
        std::string glyph = " ";
        std::string style;
    };
    void sequence(std::string_view parameters, char end);
    void put(const std::string& glyph, int width);

    cli::ScreenSize size_;
    std::vector<std::vector<Place>> places_;
    int row_ = 0;
    int column_ = 0;
    std::string style_;
};

}  // namespace cli_test
