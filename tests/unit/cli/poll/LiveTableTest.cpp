// The screen of the live table, in every size.
#include "cli/poll/LiveTable.h"

#include <gtest/gtest.h>

namespace {

using namespace std::chrono_literals;
using cli::ScreenLine;
using cli::ScreenSize;
using cli::TableRow;
using poll::Quality;

class FakeRows final : public cli::RowSource {
  public:
    std::vector<TableRow> rows;
    mutable std::size_t asked = 0;
    [[nodiscard]] TableRow row(std::size_t tag) const override {
        ++asked;
        return rows[tag];
    }
};

class LiveTableTest : public testing::Test {
  protected:
    void SetUp() override {
        rows_.rows = {
            {.name = "Boiler.Temperature",
             .value = "81.5",
             .unit = "°C",
             .quality = Quality::Good,
             .age = 300ms,
             .history = {80, 81, 81.5}},
            {.name = "Pump.Running", .value = "1", .quality = Quality::Stale, .age = 12s},
            {.name = "Valve", .quality = Quality::Bad, .error = "exception 2"},
            {.name = "New", .quality = Quality::Never},
        };
        content_.counts = {.good = 1, .stale = 1, .bad = 1, .never = 1};
        content_.nodes = {
            {.node = 1, .requests = 5, .replies = 5, .p50 = 12ms, .p99 = 30ms, .max = 31ms},
            {.node = 2, .reachable = false, .requests = 3, .timeouts = 3}};
        content_.line.load = 0.5;
        content_.line.open = true;
        listNames();
    }
    void listNames() {
        std::vector<std::string> names;
        for (const TableRow& row : rows_.rows)
            names.push_back(row.name);
        view_.setRows(names);
    }
    std::vector<std::string> screen(ScreenSize size) {
        std::vector<std::string> texts;
        for (const ScreenLine& line :
             liveTable(content_, rows_, view_, size, {.unicode = true, .widths = {18, 2}})) {
            EXPECT_GE(static_cast<std::size_t>(size.columns), line.size());
            texts.push_back(textOf(line));
        }
        EXPECT_GE(static_cast<std::size_t>(size.rows), texts.size());
        return texts;
    }

    FakeRows rows_;
    cli::TableContent content_;
    cli::TableView view_;
};

TEST_F(LiveTableTest, ShowsEverythingOnAWideScreen) {
    const std::vector<std::string> expected{
        "4 tags  1 bad  1 stale  1 never  1 good",
        "  name                                     value unit quality   age last values",
        "  Boiler.Temperature                        81.5 °C   good     0.3s ▁▆█",
        "~ Pump.Running                                 1      stale     12s",
        "! Valve                              exception 2      bad",
        "? New                                                 never",
        "",
        "",
        "node 1 ok  p50 12.0 ms  p99 30.0 ms  max 31.0 ms  requests 5  replies 5",
        "node 2 silent  requests 3  replies 0  time-outs 3",
        "line 50 % busy  cycles 0",
        "1-4/4  q quit  / filter  arrows PgUp PgDn"};
    auto actual = screen({80, 12});
    for (std::string& text : actual)
        text.erase(text.find_last_not_of(' ') + 1);
    EXPECT_EQ(expected, actual);
}

TEST_F(LiveTableTest, FitsTwentyColumns) {
    const auto lines = screen({20, 12});
    EXPECT_EQ("  Boiler.Te…    81.5", lines[2]);
    EXPECT_EQ("! Valve      except…", lines[4]);
}

TEST_F(LiveTableTest, FitsEveryOtherSize) {
    for (int columns = 0; columns < 130; ++columns) {
        for (const int rows : {0, 1, 2, 3, 5, 8, 30})
            screen({columns, rows});
    }
}

TEST_F(LiveTableTest, KeepsARowForTagsOnAShortScreen) {
    const auto lines = screen({80, 3});
    ASSERT_EQ(3U, lines.size());
    EXPECT_EQ("  Boiler.Temperature", lines[1].substr(0, 20));
}

TEST_F(LiveTableTest, ScrollsAndAsksForNoMoreThanItShows) {
    rows_.rows.clear();
    for (int i = 0; i < 100000; ++i)
        rows_.rows.push_back({.name = "tag" + std::to_string(i), .value = "1"});
    listNames();
    view_.press({cli::KeyKind::PageDown, {}});
    const auto lines = screen({80, 12});
    EXPECT_LE(rows_.asked, 12U);
    EXPECT_EQ("? tag1 ", lines[2].substr(0, 7));
    EXPECT_EQ("2-7/100000", lines.back().substr(0, 10));
}

TEST_F(LiveTableTest, ShowsTheFilterWhileItIsTyped) {
    for (const char* letter : {"/", "p", "u"})
        view_.press({cli::KeyKind::Character, letter});
    auto lines = screen({80, 12});
    EXPECT_EQ("~ Pump.Running", lines[2].substr(0, 14));
    EXPECT_EQ("", lines[3]);
    EXPECT_EQ("/pu_", lines.back());
    view_.press({cli::KeyKind::Enter, {}});
    lines = screen({80, 12});
    EXPECT_EQ("1-1/1  /pu  Esc all", lines.back().substr(0, 19));
}

TEST_F(LiveTableTest, TellsOfNodesInTroubleFirst) {
    content_.nodes.clear();
    for (int node = 1; node <= 50; ++node)
        content_.nodes.push_back({.node = node, .reachable = node != 33});
    const auto lines = screen({80, 12});
    EXPECT_EQ("node 33 silent", lines[6].substr(0, 14));
    EXPECT_EQ("node 1 ok", lines[7].substr(0, 9));
}

TEST_F(LiveTableTest, ShowsAnEmptyList) {
    rows_.rows.clear();
    listNames();
    content_ = {};
    const auto lines = screen({80, 8});
    EXPECT_EQ("0 tags", lines[0]);
    EXPECT_EQ("0-0/0", lines.back().substr(0, 5));
}

}  // namespace
