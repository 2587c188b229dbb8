#include "poll/LineMachine.h"

#include <gtest/gtest.h>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

using Texts = std::vector<std::string>;

SetupBuilder twoBlocks() {
    SetupBuilder builder;
    builder.block(1, 0, 4, milliseconds{100}).block(1, 50, 2, milliseconds{200});
    return builder;
}

TEST(LineMachineTest, EachBlockIsReadInItsPeriod) {
    FakeLine line(twoBlocks());
    line.run(milliseconds{399});
    EXPECT_EQ((Texts{"open", "r0", "r50", "r0", "r0", "r50", "r0"}), line.devices.order);
    EXPECT_EQ(0U, line.machine.snapshot().line.lateCycles);
}

TEST(LineMachineTest, TagsHaveValueQualityAndTime) {
    FakeLine line(twoBlocks());
    EXPECT_EQ(Quality::Never, line.tag(0).quality);
    line.settle();
    const TagState tag = line.tag(5);
    EXPECT_EQ(Quality::Good, tag.quality);
    EXPECT_EQ(std::vector<std::uint8_t>{2}, tag.value);
    EXPECT_EQ(line.clock.wall(), tag.at);
    EXPECT_EQ(1U, tag.count);
    EXPECT_EQ(1U, line.machine.snapshot().line.cycles);
    EXPECT_EQ(milliseconds{20}, line.machine.snapshot().line.cycle);
}

TEST(LineMachineTest, WritesGoBeforeReadsThatWait) {
    FakeLine line(twoBlocks());
    line.machine.step();  // opens
    line.machine.step();  // reads the first block; the second waits
    WriteResult first = line.machine.write(3, {7});
    WriteResult second = line.machine.write(4, {8});
    line.settle();
    EXPECT_EQ((Texts{"open", "r0", "w3", "w4", "r50"}), line.devices.order);
    EXPECT_FALSE(first.get());
    EXPECT_FALSE(second.get());
}

TEST(LineMachineTest, AWriteWithoutATagOrAPortFailsAtOnce) {
    FakeLine line(twoBlocks());
    line.settle();
    WriteResult noTag = line.machine.write(6, {1});
    line.settle();
    EXPECT_EQ((ReadError{-1, "No such tag"}), noTag.get());
    line.devices.isPresent = false;
    line.run(milliseconds{300});
    WriteResult noPort = line.machine.write(0, {1});
    line.machine.step();
    EXPECT_EQ((ReadError{-1, "The port can't be opened"}).code, noPort.get()->code);
    line.machine.close();
    EXPECT_EQ(-3, line.machine.write(0, {1}).get()->code);
    EXPECT_TRUE(line.devices.writes.empty());
}

TEST(LineMachineTest, AnOverloadedLineCountsLateCyclesAndStaysFair) {
    FakeLine line(twoBlocks());
    line.devices.answer = milliseconds{150};
    line.run(seconds{60});
    const LineState state = line.machine.snapshot().line;
    EXPECT_EQ(400U, line.devices.count);
    EXPECT_GT(state.lateCycles, 300U);
    EXPECT_NEAR(1.0, state.load, 0.001);
    EXPECT_GT(line.tag(4).count, 100U);
    EXPECT_GT(line.tag(0).count, 100U);
}

TEST(LineMachineTest, LoadIsTheLinesTimeInUse) {
    FakeLine line(twoBlocks());
    line.run(seconds{30});
    EXPECT_NEAR(0.15, line.machine.snapshot().line.load, 0.01);
}

TEST(LineMachineTest, AFailedReadKeepsTheValueAndTellsSinceWhen) {
    FakeLine line(twoBlocks());
    line.settle();
    line.devices.dead = {1};
    line.run(milliseconds{100});
    const auto since = line.clock.wall();
    line.run(milliseconds{2000});
    const TagState tag = line.tag(0);
    EXPECT_EQ(Quality::Stale, tag.quality);
    EXPECT_EQ(std::vector<std::uint8_t>{1}, tag.value);
    EXPECT_EQ(kSilent, tag.error);
    ASSERT_TRUE(tag.staleSince);
    EXPECT_LE(*tag.staleSince, since + milliseconds{400});
}

TEST(LineMachineTest, ANodeThatReturnsIsPolledAtOnce) {
    FakeLine line(twoBlocks());
    line.devices.dead = {1};
    line.run(seconds{3});
    const std::uint64_t lateUntilLost = line.machine.snapshot().line.lateCycles;
    line.run(seconds{17});
    EXPECT_FALSE(line.node(0).reachable);
    EXPECT_EQ(Quality::Never, line.tag(4).quality);
    EXPECT_EQ(kSilent, line.tag(4).error);
    line.devices.dead.clear();
    line.devices.order.clear();
    while (!line.node(0).reachable)
        line.run(milliseconds{1});
    line.settle();
    EXPECT_EQ((Texts{"r0", "r0", "r50"}), line.devices.order);
    EXPECT_EQ(Quality::Good, line.tag(4).quality);
    EXPECT_FALSE(line.tag(4).staleSince);
    EXPECT_EQ((Texts{"node 1 begins: No response", "node 1 ends: No response"}), line.events);
    EXPECT_GE(line.node(0).unreachable, seconds{19});
    EXPECT_LE(line.node(0).unreachable, seconds{30});
    EXPECT_EQ(lateUntilLost, line.machine.snapshot().line.lateCycles);
}

TEST(LineMachineTest, AFaultIsToldWhenItChangesAndNeverOnceACycle) {
    FakeLine line(twoBlocks());
    line.devices.dead = {1};
    line.run(seconds{120});
    line.devices.dead.clear();
    line.devices.noisy = {1};
    line.run(seconds{120});
    EXPECT_EQ((Texts{"node 1 begins: No response", "node 1 changes: Incorrect response checksum"}),
              line.events);
}

TEST(LineMachineTest, ProbesOfANodeAreSingleRequests) {
    FakeLine line(twoBlocks());
    line.devices.dead = {1};
    line.run(seconds{60});
    // 3 failures, then probes after 0.5, 1, 2, 4, 8 and four times 10 s, each of 0.3 s.
    EXPECT_EQ(3U + 9U, line.devices.reads.size());
    const NodeState node = line.node(0);
    EXPECT_EQ(12U, node.requests);
    EXPECT_EQ(12U, node.timeouts);
    EXPECT_EQ(0U, node.replies);
}

TEST(LineMachineTest, WhatTheDriverAnswersByItselfDependsOnNoNode) {
    SetupBuilder builder = twoBlocks();
    builder.block(1, 900, 1, milliseconds{100});
    builder.setup().blocks.back().requests = 0;
    FakeLine line(builder);
    line.devices.dead = {1};
    line.run(seconds{60});
    EXPECT_FALSE(line.node(0).reachable);
    EXPECT_EQ(12U, line.node(0).requests);
    EXPECT_EQ(Quality::Good, line.tag(6).quality);
    EXPECT_GT(line.tag(6).count, 500U);
}

TEST(LineMachineTest, RepetitionsOfFailedRequestsAreCounted) {
    SetupBuilder builder = twoBlocks();
    builder.setup().repeats = 2;
    FakeLine line(builder);
    line.devices.noisy = {1};
    line.run(milliseconds{900});
    EXPECT_EQ(3U, line.node(0).checkErrors);
    EXPECT_EQ(6U, line.node(0).retries);
}

TEST(LineMachineTest, APortThatIsPulledIsClosedAtOnceAndOpenedWhenItIsBack) {
    FakeLine line(twoBlocks());
    line.settle();
    line.devices.order.clear();
    line.devices.isPresent = false;
    line.devices.whyNot = "No such file";
    line.run(milliseconds{3500});
    EXPECT_EQ((Texts{"r0", "close", "open", "open", "open"}), line.devices.order);
    const Snapshot gone = line.machine.snapshot();
    EXPECT_FALSE(gone.line.open);
    EXPECT_EQ("No such file", gone.line.fault);
    EXPECT_EQ(Quality::Stale, gone.tags[5].quality);
    line.devices.isPresent = true;
    line.run(seconds{1});
    const Snapshot back = line.machine.snapshot();
    EXPECT_TRUE(back.line.open);
    EXPECT_EQ("", back.line.fault);
    EXPECT_EQ(Quality::Good, back.tags[5].quality);
    EXPECT_EQ(0U, back.line.lateCycles);
    EXPECT_EQ((Texts{"port begins: The port is gone", "port changes: No such file",
                     "port ends: No such file"}),
              line.events);
}

TEST(LineMachineTest, ARefusedTagIsFoundToldAndLeftOut) {
    SetupBuilder builder;
    builder.block(1, 0, 100, milliseconds{1000});
    FakeLine line(builder);
    line.devices.refused = {37};
    line.run(seconds{20});
    EXPECT_EQ(Quality::Bad, line.tag(37).quality);
    EXPECT_EQ(kRefused, line.tag(37).error);
    EXPECT_EQ(Quality::Good, line.tag(36).quality);
    EXPECT_EQ(Quality::Good, line.tag(38).quality);
    EXPECT_LE(line.devices.reads.size(), 75U);
    EXPECT_GT(line.node(0).exceptions[2], 1U);
    EXPECT_EQ(Texts{"t37 begins: Exception: Illegal data address"}, line.events);
    line.devices.refused.clear();
    line.run(seconds{60});
    EXPECT_EQ(Quality::Good, line.tag(37).quality);
    EXPECT_EQ("t37 ends: Exception: Illegal data address", line.events.back());
    EXPECT_TRUE(line.node(0).reachable);
}

TEST(LineMachineTest, LookingForAHoleHoldsUpNobody) {
    SetupBuilder builder;
    builder.block(1, 0, 100, milliseconds{1000}).block(1, 500, 1, milliseconds{20});
    FakeLine line(builder);
    for (long item = 0; item < 100; ++item)
        line.devices.refused.insert(item);
    line.run(seconds{10});
    EXPECT_GT(line.tag(100).count, 450U);
    EXPECT_EQ(Quality::Bad, line.tag(99).quality);
}

}  // namespace
}  // namespace poll
