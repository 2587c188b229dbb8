// Nodes that answer later than the driver waits: no value, and no acknowledgement, may be taken for
// another request's.
#include <gtest/gtest.h>

#include "tests/line/slow/Cell.h"

namespace slow {
namespace {

constexpr Habit kHabits[] = {Habit::Queues, Habit::Delays, Habit::Drops};
constexpr wire::Mode kModes[] = {wire::Mode::Rtu, wire::Mode::Ascii};
constexpr runtime::FrameEndBy kFrameEnds[] = {runtime::FrameEndBy::Silence,
                                              runtime::FrameEndBy::Length};

struct Pace {
    int latencyMs;
    int jitterMs;
};

/// The driver waits for 100 ms.
constexpr Pace kPaces[] = {{10, 0},   {50, 0},   {90, 0},   {110, 0},  {120, 0},
                           {250, 0},  {500, 0},  {1000, 0}, {2000, 0}, {100, 40},
                           {100, 10}, {110, 90}, {150, 140}};

class SlowNodesTest : public testing::TestWithParam<Work> {
  protected:
    /// Every pace, repeat, framing and habit; the line's speed and the frame end take turns.
    template <class Look>
    static void forEveryCell(Look look) {
        Cell cell{.work = GetParam()};
        int count = 0;
        for (const Pace& pace : kPaces) {
            for (cell.repeat = 0; cell.repeat <= 5; ++cell.repeat) {
                for (const wire::Mode mode : kModes) {
                    for (const Habit habit : kHabits) {
                        cell.latencyMs = pace.latencyMs;
                        cell.jitterMs = pace.jitterMs;
                        cell.mode = mode;
                        cell.habit = habit;
                        cell.baud = (count + cell.repeat) % 2 == 0 ? 0 : 9600;
                        cell.frameEnd = kFrameEnds[count / 2 % 2];
                        look(cell);
                        ++count;
                    }
                }
            }
        }
    }
};

TEST_P(SlowNodesTest, DeliverNothingWrong) {
    forEveryCell([](const Cell& cell) {
        const Tally tally = run(cell);
        EXPECT_EQ(0, tally.wrong) << nameOf(cell);
        EXPECT_EQ(cell.accesses, tally.right + tally.errors) << nameOf(cell);
    });
}

TEST_P(SlowNodesTest, InTimeAreAsFastAsWithoutRules) {
    Cell cell{.work = GetParam()};
    for (const int latency : {10, 50, 90}) {
        for (const wire::Mode mode : kModes) {
            cell.latencyMs = latency;
            cell.mode = mode;
            cell.knowsReplies = true;
            const Tally knowing = run(cell);
            cell.knowsReplies = false;
            const Tally blind = run(cell);
            EXPECT_EQ(cell.accesses, knowing.right) << nameOf(cell);
            EXPECT_EQ(blind.time, knowing.time) << nameOf(cell);
        }
    }
}

// The third attempt still waits when the first one is answered.
TEST_P(SlowNodesTest, AreReadAndWrittenAllTheSameWhenARepetitionWaitsLongEnough) {
    Cell cell{.work = GetParam()};
    // Requests that nobody mistakes for one another are not held back, so that the queue grows.
    const bool alike = cell.work == Work::ReadRegisters || cell.work == Work::ReadBits ||
                       cell.work == Work::ReadLongs;
    for (const int latency : {110, 120, 250}) {
        for (const Habit habit : kHabits) {
            for (const wire::Mode mode : kModes) {
                cell.latencyMs = latency;
                cell.habit = habit;
                cell.mode = mode;
                if (habit == Habit::Queues && !alike) continue;
                const Tally tally = run(cell);
                EXPECT_EQ(cell.accesses, tally.right) << nameOf(cell);
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Works, SlowNodesTest, testing::ValuesIn(kWorks));

}  // namespace
}  // namespace slow
