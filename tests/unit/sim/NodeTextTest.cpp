#include "sim/NodeText.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

using namespace std::chrono_literals;

template <typename Behaviour>
struct Row {
    const char* text;
    ForNodes<Behaviour> expected;
};

template <typename Behaviour, typename Parse>
void expectRead(std::initializer_list<Row<Behaviour>> rows, Parse parse) {
    for (const Row<Behaviour>& row : rows) {
        std::string error;
        const auto result = parse(row.text, error);
        ASSERT_TRUE(result) << row.text << ": " << error;
        EXPECT_EQ(row.expected, *result) << row.text;
        EXPECT_EQ("", error) << row.text;
    }
}

template <typename Parse>
void expectRefused(std::initializer_list<const char*> texts, Parse parse) {
    for (const char* const text : texts) {
        std::string error;
        EXPECT_FALSE(parse(text, error)) << text;
        EXPECT_TRUE(error.starts_with("not ")) << text << ": " << error;
    }
}

TEST(NodeTextTest, TurnaroundsAreFixedJitterOrGrow) {
    expectRead<Turnaround>(
        {
            {"20", {{}, {.least = 20ms, .most = 20ms}}},
            {"1.75", {{}, {.least = 1750us, .most = 1750us}}},
            {"20..60", {{}, {.least = 20ms, .most = 60ms}}},
            {"20+5", {{}, {.least = 20ms, .most = 1h, .growth = 5ms}}},
            {"0+0.5..200", {{}, {.least = 0ms, .most = 200ms, .growth = 500us}}},
            {"20+0..60", {{}, {.least = 20ms, .most = 20ms}}},
            {"3:20..60", {std::uint8_t{3}, {.least = 20ms, .most = 60ms}}},
            {"255:3600000", {std::uint8_t{255}, {.least = 1h, .most = 1h}}},
        },
        parseTurnaround);
    expectRefused({"", "x", "-1", "20..", "..60", "60..20", "20+", "+5", "20+5..10", "20..60+5",
                   "20 ", "3600001", "0:20", "256:20", ":20", "3:", "3:4:20", "20ms"},
                  parseTurnaround);
}

TEST(NodeTextTest, PresencesAreTimesThereAndAway) {
    expectRead<Presence>(
        {
            {"10/5", {{}, {.there = 10s, .away = 5s}}},
            {"3:0.5/0.25", {std::uint8_t{3}, {.there = 500ms, .away = 250ms}}},
            {"0/1", {{}, {.there = 0s, .away = 1s}}},
            {"1/0", {{}, {.there = 1s, .away = 0s}}},
        },
        parsePresence);
    expectRefused({"", "10", "10/", "/5", "0/0", "-1/5", "10/5/3", "3601/1", "0:10/5", "x:10/5"},
                  parsePresence);
}

TEST(NodeTextTest, RefusedRangesNameAnAreaAndAddresses) {
    expectRead<RefusedRange>(
        {
            {"HREG:100-199", {{}, {.area = Area::HoldingRegister, .first = 100, .last = 199}}},
            {"IREG:7", {{}, {.area = Area::InputRegister, .first = 7, .last = 7}}},
            {"OUTP:0-65535", {{}, {.area = Area::Coil, .first = 0, .last = 65535}}},
            {"2:INP:3-3", {std::uint8_t{2}, {.area = Area::DiscreteInput, .first = 3, .last = 3}}},
        },
        parseRefusedRange);
    expectRefused({"", "HREG", "HREG:", "HREG:-1", "HREG:5-4", "HREG:1-", "HREG:0-65536", "hreg:1",
                   "X:1", "100-199", "0:HREG:1", "300:HREG:1", "1:2:HREG:1"},
                  parseRefusedRange);
}

TEST(NodeTextTest, TheErrorTellsWhatIsAccepted) {
    std::string error;
    EXPECT_FALSE(parseRefusedRange("HREG", error));
    EXPECT_EQ(
        "not AREA:FIRST[-LAST] (OUTP, INP, HREG or IREG; addresses from 0 to 65535), with NODE: in "
        "front for one node",
        error);
}

}  // namespace
}  // namespace sim
