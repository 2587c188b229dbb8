// Text in columns.
#include "cli/poll/ScreenCells.h"

#include <gtest/gtest.h>

namespace {

using cli::Align;
using cli::columnsOf;
using cli::LineBuilder;
using cli::textOf;

std::string fitted(const std::string& text, int width, Align align = Align::Left,
                   bool unicode = true) {
    LineBuilder line(100, unicode);
    line.putFitted(text, width, cli::CellStyle::Plain, align).put("|");
    return textOf(line.take());
}

TEST(ScreenCellsTest, FillsUpAndCuts) {
    EXPECT_EQ("abc  |", fitted("abc", 5));
    EXPECT_EQ("  abc|", fitted("abc", 5, Align::Right));
    EXPECT_EQ("abcde|", fitted("abcde", 5));
    EXPECT_EQ("abcd…|", fitted("abcdef", 5));
    EXPECT_EQ("abcd~|", fitted("abcdef", 5, Align::Left, false));
    EXPECT_EQ("a|", fitted("abcdef", 1));
    EXPECT_EQ("|", fitted("abcdef", 0));
}

TEST(ScreenCellsTest, CountsWideAndCombiningCharacters) {
    EXPECT_EQ(3, columnsOf("äöü", true));
    EXPECT_EQ(4, columnsOf("温度", true));
    EXPECT_EQ(1, columnsOf("e\xCC\x81", true));
    EXPECT_EQ("温度 |", fitted("温度", 5));
    EXPECT_EQ("温…|", fitted("温度", 3)) << "no room for the second and the mark";
    EXPECT_EQ(" …|", fitted("温度", 2)) << "half a character is a blank";
    EXPECT_EQ("e\xCC\x81 |", fitted("e\xCC\x81", 2));
}

TEST(ScreenCellsTest, ShowsNothingThatATerminalWouldActOn) {
    EXPECT_EQ("?[2Jx|", fitted("\x1B[2Jx", 5));
    EXPECT_EQ("a?b|", fitted("a\nb", 3));
    EXPECT_EQ("?31m|", fitted("\xC2\x9B"
                              "31m",
                              4));
    EXPECT_EQ("?|", fitted("\xE2\x80\xAE", 1)) << "turns the direction of writing";
    EXPECT_EQ("??a|", fitted("\xFF\xC3"
                             "a",
                             3))
        << "no UTF-8";
    EXPECT_EQ("?C|", fitted("°C", 2, Align::Left, false)) << "a terminal of ASCII alone";
}

TEST(ScreenCellsTest, PilesUpNoMarksWithoutEnd) {
    std::string text = "e";
    for (int i = 0; i < 10000; ++i)
        text += "\xCC\x81";
    LineBuilder line(10, true);
    EXPECT_LE(textOf(line.put(text).take()).size(), 40U);
}

TEST(ScreenCellsTest, NeverGrowsBeyondItsColumns) {
    for (int columns = 0; columns < 8; ++columns) {
        LineBuilder line(columns, true);
        line.put("a温").putFitted("温b", 4).put("xyz");
        EXPECT_EQ(0, line.room());
        EXPECT_EQ(static_cast<std::size_t>(columns), line.take().size());
    }
}

}  // namespace
