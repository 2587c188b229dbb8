// Nodes that are not there, that come back, that answer much too late or too often.
#include <gtest/gtest.h>

#include "tests/line/slow/Cell.h"

namespace slow {
namespace {

NodesOptions threeNodes() {
    return {.nodes = {{.address = 1}, {.address = 2}, {.address = 3}}};
}

/// Rounds in which every node is read, another register each time.
void readInTurns(Setting& setting, int rounds, int firstOffset = 0) {
    for (int round = 0; round < rounds; ++round)
        for (const int node : {1, 2, 3})
            setting.read(node, Items::Holding, firstOffset + round, 1);
}

/// What a round trip of three nodes costs when the second one is not there.
Tally withADeadNode(Cell cell, bool knowsReplies) {
    cell.knowsReplies = knowsReplies;
    Setting setting(cell, threeNodes());
    setting.line().setDead(2, true);
    readInTurns(setting, 20);
    return setting.tally();
}

TEST(OtherNodesTest, ADeadNodeCostsTheOthersNothing) {
    for (const int repeat : {0, 2, 5}) {
        for (const wire::Mode mode : {wire::Mode::Rtu, wire::Mode::Ascii}) {
            const Cell cell{.repeat = repeat, .mode = mode};
            const Tally knowing = withADeadNode(cell, true);
            EXPECT_EQ(40, knowing.right) << nameOf(cell);
            EXPECT_EQ(20, knowing.errors) << nameOf(cell);
            EXPECT_EQ(withADeadNode(cell, false).time, knowing.time) << nameOf(cell);
        }
    }
}

TEST(OtherNodesTest, ANodeThatDiedCostsOneWaitAtMost) {
    const Cell cell{};
    const auto timeOf = [&cell](bool knowsReplies) {
        Cell other = cell;
        other.knowsReplies = knowsReplies;
        Setting setting(other, threeNodes());
        readInTurns(setting, 5);
        setting.line().setDead(2, true);
        readInTurns(setting, 20, 5);
        EXPECT_EQ(0, setting.tally().wrong);
        EXPECT_EQ(20, setting.tally().errors);
        return setting.tally().time;
    };
    EXPECT_LE(timeOf(true), timeOf(false) + Ms{2 * cell.timeoutMs});
}

TEST(OtherNodesTest, ANodeThatComesBackIsReadAgain) {
    Setting setting(Cell{}, threeNodes());
    readInTurns(setting, 5);
    setting.line().setDead(2, true);
    readInTurns(setting, 5, 5);
    EXPECT_EQ(25, setting.tally().right);
    setting.line().setDead(2, false);
    // Its first reply may be one that it owed.
    readInTurns(setting, 1, 10);
    EXPECT_LE(27, setting.tally().right);
    const int before = setting.tally().right;
    readInTurns(setting, 5, 11);
    EXPECT_EQ(before + 15, setting.tally().right);
    EXPECT_EQ(0, setting.tally().wrong);
}

// Its first reply may belong to any of the requests that went before.
TEST(OtherNodesTest, ANodeThatWasNeverThereIsReadSoonAfterItComes) {
    for (const int latency : {10, 120, 250}) {
        Setting setting(Cell{.latencyMs = latency});
        setting.line().setDead(1, true);
        for (int i = 0; i < 20; ++i)
            setting.read(1, Items::Holding, i, 1);
        setting.line().setDead(1, false);
        const auto back = setting.line().now();
        while (setting.tally().right == 0 &&
               setting.line().now() < back + std::chrono::seconds{20}) {
            setting.line().pass(Ms{100});
            setting.read(1, Items::Holding, setting.tally().errors % 100, 1);
        }
        EXPECT_GT(std::chrono::seconds{7}, setting.line().now() - back) << latency;
        for (int i = 0; i < 40; ++i)
            setting.read(1, Items::Holding, i, 1);
        EXPECT_EQ(41, setting.tally().right) << latency;
        EXPECT_EQ(0, setting.tally().wrong) << latency;
    }
}

// A node that takes 10 s for each request in turn pauses for longer between two answers than
// anybody waits for the silence of a node of which nothing is known.
TEST(OtherNodesTest, AnAnswerTenSecondsLateIsNobodysValue) {
    for (const Habit habit : {Habit::Delays, Habit::Drops}) {
        for (const int repeat : {0, 2, 5}) {
            for (const int pauseMs : {0, 100, 1000, 4000}) {
                const Cell cell{
                    .latencyMs = 10'000, .repeat = repeat, .habit = habit, .pauseMs = pauseMs};
                EXPECT_EQ(0, run(cell).wrong) << nameOf(cell);
            }
        }
    }
}

/// A node that is well for a while, then lets one answer wait, and is well again.
TEST(OtherNodesTest, AfterOneAnswerTenSecondsLateAllIsWell) {
    Setting setting(Cell{.habit = Habit::Delays});
    for (int i = 0; i < 10; ++i)
        setting.read(1, Items::Holding, i, 1);
    setting.line().setLatency(10'000);
    setting.read(1, Items::Holding, 10, 1);
    setting.line().setLatency(10);
    for (int i = 11; i < 80; ++i) {
        setting.line().pass(Ms{300});
        setting.read(1, Items::Holding, i, 1);
    }
    EXPECT_EQ(0, setting.tally().wrong);
}

Tally withRepliesSentSoOften(int times, int againAfterMs, wire::Mode mode) {
    NodesOptions nodes;
    nodes.times = times;
    nodes.againAfterMs = againAfterMs;
    Setting setting(Cell{.mode = mode}, nodes);
    for (int i = 0; i < 40; ++i)
        setting.read(1, Items::Holding, i, 1);
    return setting.tally();
}

TEST(OtherNodesTest, AnswersThatComeTwiceAreNobodysValue) {
    for (const wire::Mode mode : {wire::Mode::Rtu, wire::Mode::Ascii}) {
        for (const int again : {1, 5, 15, 30, 60, 90}) {
            const Tally tally = withRepliesSentSoOften(2, again, mode);
            EXPECT_EQ(0, tally.wrong) << again;
            EXPECT_LT(0, tally.right) << again;
        }
    }
}

/// What one access takes at most: for each attempt the longest wait for the line and two timeouts,
/// until the reply begins and until it ends.
Ms longestAccess(const Cell& cell) {
    return (cell.repeat + 1) * (Ms{runtime::LineExchange::kLongestWait} + 3 * Ms{cell.timeoutMs});
}

TEST(OtherNodesTest, AnAnswerThatIsSentForEverEndsEachAccess) {
    for (const wire::Mode mode : {wire::Mode::Rtu, wire::Mode::Ascii}) {
        for (const int again : {1, 5, 15, 30, 60, 90}) {
            const Tally tally = withRepliesSentSoOften(NodesOptions::kForEver, again, mode);
            EXPECT_EQ(40, tally.right + tally.wrong + tally.errors) << again;
            EXPECT_EQ(0, tally.wrong) << again;
            EXPECT_GE(40 * longestAccess(Cell{}), tally.time) << again;
        }
    }
}

// What the tests with rules are worth.
TEST(OtherNodesTest, ALateNodeDeliversAnothersValueEachTimeWithoutRules) {
    Cell cell{.latencyMs = 120, .knowsReplies = false};
    const Tally tally = run(cell);
    EXPECT_EQ(1, tally.right);
    EXPECT_EQ(39, tally.wrong);
}

}  // namespace
}  // namespace slow
