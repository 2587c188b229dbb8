#include "poll/Schedule.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;

class ScheduleTest : public testing::Test {
  protected:
    static Schedule::TimePoint at(int ms) { return Schedule::TimePoint{milliseconds{ms}}; }
    static std::vector<std::size_t> takeAll(Schedule& schedule, int ms) {
        std::vector<std::size_t> taken;
        while (const auto block = schedule.take(at(ms)))
            taken.push_back(*block);
        return taken;
    }
};

using Blocks = std::vector<std::size_t>;

TEST_F(ScheduleTest, EqualBlocksComeInTheirOrder) {
    Schedule schedule({milliseconds{100}, milliseconds{100}, milliseconds{100}}, at(0));
    EXPECT_EQ((Blocks{0, 1, 2}), takeAll(schedule, 0));
    EXPECT_EQ(Blocks{}, takeAll(schedule, 99));
    EXPECT_EQ((Blocks{0, 1, 2}), takeAll(schedule, 100));
    EXPECT_EQ(0U, schedule.lateCycles());
}

TEST_F(ScheduleTest, EachBlockHasItsPeriod) {
    Schedule schedule({milliseconds{300}, milliseconds{100}}, at(0));
    EXPECT_EQ((Blocks{0, 1}), takeAll(schedule, 0));
    EXPECT_EQ(Blocks{1}, takeAll(schedule, 100));
    EXPECT_EQ(Blocks{1}, takeAll(schedule, 200));
    EXPECT_EQ((Blocks{0, 1}), takeAll(schedule, 300));
}

TEST_F(ScheduleTest, LatenessOfLessThanAPeriodKeepsThePhase) {
    Schedule schedule({milliseconds{100}}, at(0));
    takeAll(schedule, 99);
    EXPECT_EQ(at(100), *schedule.nextDue());
    EXPECT_EQ(0U, schedule.lateCycles());
}

TEST_F(ScheduleTest, MissedPeriodsAreCountedAndNotMadeUpFor) {
    Schedule schedule({milliseconds{100}}, at(0));
    EXPECT_EQ(Blocks{0}, takeAll(schedule, 350));
    EXPECT_EQ(3U, schedule.lateCycles());
    EXPECT_EQ(at(400), *schedule.nextDue());
}

TEST_F(ScheduleTest, WhatWasNotToBeReadIsNotLate) {
    Schedule schedule({milliseconds{100}}, at(0));
    takeAll(schedule, 350);
    schedule.forgive();
    EXPECT_EQ(0U, schedule.lateCycles());
}

TEST_F(ScheduleTest, AnOverloadedLineLeavesNoBlockBehind) {
    Schedule schedule({milliseconds{1}, milliseconds{1}, milliseconds{1000}}, at(0));
    std::vector<int> reads(3);
    for (int now = 0; now < 10000; now += 50)
        ++reads[*schedule.take(at(now))];
    EXPECT_EQ(10, reads[2]);
    EXPECT_EQ(reads[0], reads[1]);
}

TEST_F(ScheduleTest, RestartedBlocksAreDueAtOnceAndNotLate) {
    Schedule schedule({milliseconds{100}, milliseconds{100}}, at(0));
    takeAll(schedule, 0);
    schedule.restart({1}, at(30));
    EXPECT_EQ(Blocks{1}, takeAll(schedule, 30));
    schedule.restartAll(at(5000));
    EXPECT_EQ((Blocks{0, 1}), takeAll(schedule, 5000));
    EXPECT_EQ(0U, schedule.lateCycles());
}

TEST_F(ScheduleTest, NoBlocksAreNeverDue) {
    Schedule schedule({}, at(0));
    EXPECT_FALSE(schedule.nextDue());
    EXPECT_FALSE(schedule.take(at(1)));
}

}  // namespace
}  // namespace poll
