#include "poll/LineCosts.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;

constexpr const char* kLine =
    "CfgVer=1 defNodeId=1 txMode=ASCII uart=com1 baudrate=19200 parity=even bits=7 stopbits=1 "
    "delay=3 Node2::delay=20";

TEST(LineCostsTest, TheDriversGapIsTwelveCharactersInWholeMilliseconds) {
    struct Row {
        int baud;
        int gap;
    };
    for (const Row& row : {Row{150, 800}, Row{1200, 100}, Row{9600, 13}, Row{19200, 7},
                           Row{38400, 4}, Row{57600, 3}, Row{115200, 2}, Row{0, 1}})
        EXPECT_EQ(milliseconds{row.gap}, driverGap(row.baud)) << row.baud;
}

TEST(LineCostsTest, TheConfigurationTellsTheLineAndThePauses) {
    const auto config = settings::scanConfig("line.cfg", kLine);
    constexpr std::array nodes{1, 2};
    const CostModel costs = costsOf(config, {}, nodes, {.turnaround = milliseconds{9}});
    EXPECT_EQ(wire::Mode::Ascii, costs.mode);
    EXPECT_EQ(19200, costs.rate.baud);
    EXPECT_EQ(1 + 7 + 1 + 1, costs.rate.characterBits);
    EXPECT_EQ(milliseconds{7}, costs.gapAfterReply);
    EXPECT_EQ(milliseconds{9}, costs.turnaround);
    EXPECT_EQ(milliseconds{3}, costs.delays.at(1));
    EXPECT_EQ(milliseconds{20}, costs.delays.at(2));
}

TEST(LineCostsTest, NoGapIsWaitedForWhereTheLengthEndsAReply) {
    const auto config = settings::scanConfig("line.cfg", kLine);
    EXPECT_EQ(milliseconds{0}, costsOf(config, {}, {}, {.endsByLength = true}).gapAfterReply);
    EXPECT_EQ(milliseconds{20},
              costsOf(config, {}, {}, {.shortestGap = milliseconds{20}}).gapAfterReply);
}

}  // namespace
}  // namespace poll
