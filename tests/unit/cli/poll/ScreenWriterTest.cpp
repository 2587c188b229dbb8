// Each draw leaves exactly its lines on the terminal, and sends no more than what changed.
#include "cli/poll/ScreenWriter.h"

#include <gtest/gtest.h>

#include <random>

#include "tests/unit/cli/poll/ModelTerminal.h"

namespace {

using cli::CellStyle;
using cli::LineBuilder;
using cli::ScreenLine;
using cli::ScreenSize;
using cli::ScreenWriter;
using cli_test::ModelTerminal;

ScreenLine line(const std::string& text, CellStyle style = CellStyle::Plain) {
    return LineBuilder(1000, true).put(text, style).take();
}

TEST(ScreenWriterTest, DrawsEverythingTheFirstTime) {
    ScreenWriter writer(true);
    ModelTerminal terminal({10, 3});
    terminal.show(writer.draw({line("one"), line("two", CellStyle::Bad)}, {10, 3}));
    EXPECT_EQ("one", terminal.line(0));
    EXPECT_EQ("two", terminal.line(1));
    EXPECT_EQ("31", terminal.styleAt(1, 0));
    EXPECT_EQ("", terminal.line(2)) << "what stood there before is gone";
}

TEST(ScreenWriterTest, SendsNothingWhenNothingChanged) {
    ScreenWriter writer(true);
    writer.draw({line("one")}, {10, 3});
    EXPECT_EQ("", writer.draw({line("one")}, {10, 3}));
}

TEST(ScreenWriterTest, SendsOnlyTheCharactersThatChanged) {
    ScreenWriter writer(true);
    writer.draw({line("name          value 123 unit")}, {40, 3});
    EXPECT_EQ("\x1B[1;23H4", writer.draw({line("name          value 124 unit")}, {40, 3}));
}

TEST(ScreenWriterTest, ClearsTheRestOfALineThatBecameShorter) {
    ScreenWriter writer(true);
    ModelTerminal terminal({20, 1});
    terminal.show(writer.draw({line("a long text")}, {20, 1}));
    const std::string bytes = writer.draw({line("a")}, {20, 1});
    terminal.show(bytes);
    EXPECT_EQ("\x1B[1;3H\x1B[K", bytes);
    EXPECT_EQ("a", terminal.line(0));
}

TEST(ScreenWriterTest, LeavesOutWhatDoesNotFit) {
    ScreenWriter writer(true);
    ModelTerminal terminal({3, 1});
    terminal.show(writer.draw({line("ab温cd"), line("second")}, {3, 1}));
    EXPECT_EQ("ab", terminal.line(0));
}

TEST(ScreenWriterTest, BeginsAnewAfterAResizeAndWhenTold) {
    ScreenWriter writer(true);
    ModelTerminal terminal({10, 2});
    terminal.show(writer.draw({line("one"), line("two")}, {10, 2}));
    terminal.resize({5, 3});
    terminal.show(writer.draw({line("one"), line("two")}, {5, 3}));
    EXPECT_EQ("one", terminal.line(0));
    EXPECT_EQ("", terminal.line(2));

    terminal.resize({5, 3});  // Another program has written over it.
    writer.forget();
    terminal.show(writer.draw({line("one"), line("two")}, {5, 3}));
    EXPECT_EQ("two", terminal.line(1));
}

TEST(ScreenWriterTest, NeedsNoColours) {
    ScreenWriter writer(false);
    std::string all;
    for (const CellStyle style : {CellStyle::Title, CellStyle::Dim, CellStyle::Good,
                                  CellStyle::Warning, CellStyle::Bad, CellStyle::Plain}) {
        all += writer.draw({line("text", style)}, {10, 1});
    }
    for (const char* colour : {";30", ";31", ";32", ";33", ";34", ";35", ";36", ";37"})
        EXPECT_EQ(std::string::npos, all.find(colour)) << all;
}

/// Texts with wide and combining characters in all styles, many of them like the one before.
class RandomScreens {
  public:
    explicit RandomScreens(unsigned seed) : random_(seed) {}

    std::vector<ScreenLine> next() {
        for (std::string& text : texts_) {
            if (pick(3) != 0) continue;
            text.clear();
            const int length = pick(14);
            for (int i = 0; i < length; ++i)
                text += kGlyphs[static_cast<std::size_t>(pick(static_cast<int>(kGlyphs.size())))];
        }
        std::vector<ScreenLine> lines;
        for (const std::string& text : texts_) {
            LineBuilder builder(12, true);
            builder.put(text, static_cast<CellStyle>(pick(6))).put(text);
            lines.push_back(builder.take());
        }
        return lines;
    }
    int pick(int count) { return std::uniform_int_distribution<int>(0, count - 1)(random_); }

  private:
    const std::vector<std::string> kGlyphs{"a", "b", " ", " ", " ", "温", "度", "e\xCC\x81", "ä"};
    std::mt19937 random_;
    std::vector<std::string> texts_{"", "", "", ""};
};

/// @return what a terminal of that many columns can show of a line.
std::string shown(ScreenLine full, std::size_t columns) {
    const bool halved = full.size() > columns && full[columns].glyph.empty();
    full.resize(std::min(full.size(), columns));
    if (halved && !full.empty()) full.back().glyph = " ";
    return cli::textOf(full);
}

TEST(ScreenWriterTest, LeavesExactlyItsLinesAfterAnyChange) {
    for (unsigned seed = 0; seed < 300; ++seed) {
        RandomScreens screens(seed);
        const ScreenSize size{5 + screens.pick(9), 1 + screens.pick(5)};
        ScreenWriter writer(true);
        ModelTerminal terminal(size);
        for (int step = 0; step < 20; ++step) {
            const auto lines = screens.next();
            terminal.show(writer.draw(lines, size));
            for (int row = 0; row < std::min(size.rows, 4); ++row) {
                ASSERT_EQ(shown(lines[static_cast<std::size_t>(row)],
                                static_cast<std::size_t>(size.columns)),
                          terminal.line(row))
                    << "seed " << seed << " step " << step;
            }
        }
    }
}

}  // namespace
