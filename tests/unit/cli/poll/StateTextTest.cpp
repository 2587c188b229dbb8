// Words for counters and ages.
#include "cli/poll/StateText.h"

#include <gtest/gtest.h>

#include "cli/poll/LiveTable.h"

namespace {

using namespace std::chrono_literals;

TEST(StateTextTest, TellsOfANode) {
    poll::NodeState node{.node = 3, .requests = 120, .replies = 118, .timeouts = 2};
    node.p50 = 12400us;
    node.p99 = 30ms;
    node.max = 1055ms;
    node.exceptions[2] = 7;
    EXPECT_EQ(
        "node 3 ok  p50 12.4 ms  p99 30.0 ms  max 1055 ms  requests 120  replies 118"
        "  time-outs 2  exception 2: 7",
        cli::nodeText(node));
}

TEST(StateTextTest, TellsOfASilentNode) {
    const poll::NodeState node{
        .node = 250, .reachable = false, .requests = 3, .timeouts = 3, .unreachable = 12s};
    EXPECT_EQ("node 250 silent  12 s lost  requests 3  replies 0  time-outs 3",
              cli::nodeText(node));
}

TEST(StateTextTest, TellsOfALine) {
    poll::LineState line;
    line.load = 0.426;
    line.cycle = 812ms;
    line.cycles = 12;
    line.lateCycles = 3;
    line.open = true;
    EXPECT_EQ("line 43 % busy  cycle 812 ms  cycles 12  late 3", cli::lineText(line));
    line = {};
    line.fault = "no such device";
    EXPECT_EQ("line closed: no such device  cycles 0", cli::lineText(line));
}

TEST(StateTextTest, EndsEveryStatisticWithALineEnd) {
    poll::Snapshot snapshot;
    snapshot.nodes = {{.node = 1}, {.node = 2}};
    snapshot.line.open = true;
    EXPECT_EQ(
        "node 1 ok  requests 0  replies 0\nnode 2 ok  requests 0  replies 0\n"
        "line 0 % busy  cycles 0\n",
        cli::statisticsText(snapshot));
}

TEST(StateTextTest, WritesAgesShort) {
    EXPECT_EQ("0.0s", cli::ageText(-5s));
    EXPECT_EQ("0.3s", cli::ageText(399ms));
    EXPECT_EQ("9.9s", cli::ageText(9999ms));
    EXPECT_EQ("10s", cli::ageText(10s));
    EXPECT_EQ("99s", cli::ageText(99s));
    EXPECT_EQ("1m", cli::ageText(100s));
    EXPECT_EQ("99m", cli::ageText(99min));
    EXPECT_EQ("47h", cli::ageText(47h));
    EXPECT_EQ("2d", cli::ageText(48h));
}

}  // namespace
