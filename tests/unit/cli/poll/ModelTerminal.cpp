// Applies control sequences to a grid of characters.
#include "tests/unit/cli/poll/ModelTerminal.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace cli_test {

using cli::ScreenSize;

ModelTerminal::ModelTerminal(ScreenSize size) {
    resize(size);
}

void ModelTerminal::resize(ScreenSize size) {
    size_ = size;
    places_.assign(static_cast<std::size_t>(size.rows),
                   std::vector<Place>(static_cast<std::size_t>(size.columns), Place{"#", "7"}));
}

void ModelTerminal::show(std::string_view bytes) {
    for (std::size_t i = 0; i < bytes.size();) {
        if (bytes[i] == '\x1B') {
            ASSERT_EQ('[', bytes.substr(i + 1, 1)[0]);
            std::size_t end = i + 2;
            while (end < bytes.size() && (bytes[end] < '@' || bytes[end] > '~'))
                ++end;
            ASSERT_LT(end, bytes.size()) << "a torn sequence";
            sequence(bytes.substr(i + 2, end - i - 2), bytes[end]);
            i = end + 1;
            continue;
        }
        std::size_t end = i + 1;
        while (end < bytes.size() && (static_cast<unsigned char>(bytes[end]) & 0xC0) == 0x80)
            ++end;
        const std::string glyph(bytes.substr(i, end - i));
        put(glyph, cli::columnsOf(glyph, true));
        i = end;
    }
}

void ModelTerminal::sequence(std::string_view parameters, char end) {
    const std::string text(parameters);
    if (end == 'H') {
        row_ = std::atoi(text.c_str()) - 1;
        column_ = std::atoi(text.substr(text.find(';') + 1).c_str()) - 1;
        ASSERT_TRUE(row_ >= 0 && row_ < size_.rows && column_ >= 0 && column_ < size_.columns);
    } else if (end == 'm') {
        style_ = text == "0" ? "" : text.substr(2);
    } else if (end == 'J') {
        ASSERT_EQ("2", text);
        ASSERT_EQ("", style_) << "the screen would be cleared in the colours of the pen";
        for (auto& line : places_)
            line.assign(line.size(), Place{});
    } else if (end == 'K') {
        ASSERT_EQ("", text);
        ASSERT_EQ("", style_);
        for (int column = column_; column < size_.columns; ++column)
            places_[static_cast<std::size_t>(row_)][static_cast<std::size_t>(column)] = Place{};
    } else {
        FAIL() << "unknown sequence " << text << end;
    }
}

void ModelTerminal::put(const std::string& glyph, int width) {
    auto& line = places_[static_cast<std::size_t>(row_)];
    if (width == 0) {
        line[static_cast<std::size_t>(column_ - 1)].glyph += glyph;
        return;
    }
    ASSERT_LE(column_ + width, size_.columns) << "'" << glyph << "' behind the last column";
    // Half of a wide character that is written over becomes a blank.
    if (line[static_cast<std::size_t>(column_)].glyph.empty())
        line[static_cast<std::size_t>(column_ - 1)].glyph = " ";
    const int behind = column_ + width;
    if (behind < size_.columns && line[static_cast<std::size_t>(behind)].glyph.empty())
        line[static_cast<std::size_t>(behind)].glyph = " ";
    line[static_cast<std::size_t>(column_)] = {glyph, style_};
    if (width == 2) line[static_cast<std::size_t>(column_ + 1)] = {"", style_};
    column_ += width;
}

std::string ModelTerminal::line(int row) const {
    std::string text;
    for (const Place& place : places_[static_cast<std::size_t>(row)])
        text += place.glyph;
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

std::string ModelTerminal::styleAt(int row, int column) const {
    return places_[static_cast<std::size_t>(row)][static_cast<std::size_t>(column)].style;
}

}  // namespace cli_test
