// Which characters of a reply have left when. No clock: every instant is made up.
#include "sim/Departure.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

using namespace std::chrono_literals;
using wire::Bytes;
using wire::LineRate;

constexpr LineRate kMillisecond{.baud = 10000, .characterBits = 10};  // A character.

class DepartureTest : public testing::Test {
  protected:
    static Bytes taken(Departure& departure, Instant now) {
        const wire::ByteView bytes = departure.take(now);
        return {bytes.begin(), bytes.end()};
    }

    const Instant t0 = Instant(1h);
};

TEST_F(DepartureTest, WithoutARateAllLeavesAtOnce) {
    Departure departure({.bytes = {1, 2, 3}}, {.baud = 0}, t0);
    EXPECT_EQ(t0, departure.next());
    EXPECT_EQ(Bytes{}, taken(departure, t0 - 1ns));
    EXPECT_FALSE(departure.finished(t0));
    EXPECT_EQ((Bytes{1, 2, 3}), taken(departure, t0));
    EXPECT_TRUE(departure.finished(t0));
    EXPECT_EQ(t0, departure.end());
}

TEST_F(DepartureTest, ACharacterCanBeReadAtItsEnd) {
    Departure departure({.bytes = {1, 2, 3}}, kMillisecond, t0);
    EXPECT_EQ(t0 + 1ms, departure.next());
    EXPECT_EQ(Bytes{}, taken(departure, t0 + 1ms - 1ns));
    EXPECT_EQ(Bytes{1}, taken(departure, t0 + 1ms));
    EXPECT_EQ(t0 + 2ms, departure.next());
    EXPECT_EQ(Bytes{}, taken(departure, t0 + 1500us));
    EXPECT_EQ(Bytes{2}, taken(departure, t0 + 2ms));
    EXPECT_FALSE(departure.finished(t0 + 2ms));
    EXPECT_EQ(Bytes{3}, taken(departure, t0 + 3ms));
    EXPECT_TRUE(departure.finished(t0 + 3ms));
    EXPECT_EQ(t0 + 3ms, departure.end());
}

TEST_F(DepartureTest, ALateWakeUpDelaysNothingBehindIt) {
    Departure departure({.bytes = {1, 2, 3, 4}}, kMillisecond, t0);
    EXPECT_EQ((Bytes{1, 2}), taken(departure, t0 + 2900us));
    EXPECT_EQ(t0 + 3ms, departure.next());
    EXPECT_EQ((Bytes{3, 4}), taken(departure, t0 + 7ms));
    EXPECT_TRUE(departure.finished(t0 + 7ms));
    EXPECT_EQ(t0 + 4ms, departure.end()) << "the line has been free since then";
}

TEST_F(DepartureTest, GroupsLeaveWithTheirLastCharacterAndTheRestOnTime) {
    const LineRate fast{.baud = 115200, .characterBits = 10};
    Departure departure({.bytes = {1, 2, 3}}, fast, t0);
    EXPECT_EQ(t0 + wire::timeOfCharacters(2, fast), departure.next());
    EXPECT_EQ((Bytes{1, 2}), taken(departure, departure.next()));
    EXPECT_EQ(t0 + wire::timeOfCharacters(3, fast), departure.next());
    EXPECT_EQ(Bytes{3}, taken(departure, departure.next()));
}

TEST_F(DepartureTest, NothingToSendIsOverAtOnce) {
    Departure departure({}, kMillisecond, t0);
    EXPECT_EQ(t0, departure.next());
    EXPECT_TRUE(departure.finished(t0));
}

TEST_F(DepartureTest, DripsAtTheLinesSpeedWithPausesBetween) {
    Departure departure({.bytes = {1, 2, 3, 4, 5}, .dripBytes = 2, .dripGapMs = 10}, kMillisecond,
                        t0);
    EXPECT_EQ((Bytes{1, 2}), taken(departure, t0 + 2ms));
    EXPECT_EQ(t0 + 12ms + 1ms, departure.next());
    EXPECT_EQ((Bytes{3, 4}), taken(departure, t0 + 14ms));
    EXPECT_EQ(Bytes{5}, taken(departure, t0 + 25ms));
    EXPECT_TRUE(departure.finished(t0 + 25ms)) << "no pause behind the last piece";
}

TEST_F(DepartureTest, APauseIsNeverShorterThanItShouldBe) {
    Departure departure({.bytes = {1, 2, 3}, .dripBytes = 1, .dripGapMs = 10}, {.baud = 0}, t0);
    EXPECT_EQ(Bytes{1}, taken(departure, t0 + 100ms));
    EXPECT_EQ(Bytes{}, taken(departure, t0 + 110ms - 1ns));
    EXPECT_EQ(Bytes{2}, taken(departure, t0 + 110ms));
    EXPECT_EQ(t0 + 120ms, departure.next());
}

TEST_F(DepartureTest, DripsWithoutPausesComeOutOneByOne) {
    Departure departure({.bytes = {1, 2}, .dripBytes = 1}, {.baud = 0}, t0);
    EXPECT_EQ(Bytes{1}, taken(departure, t0));
    EXPECT_EQ(t0, departure.next());
    EXPECT_EQ(Bytes{2}, taken(departure, t0));
    EXPECT_TRUE(departure.finished(t0));
}

TEST_F(DepartureTest, BeforeAHangUpTheLastPieceHasItsPause) {
    Departure departure({.bytes = {1}, .dripBytes = 1, .dripGapMs = 10, .hangUp = true},
                        {.baud = 0}, t0);
    EXPECT_EQ(Bytes{1}, taken(departure, t0));
    EXPECT_FALSE(departure.finished(t0));
    EXPECT_EQ(t0 + 10ms, departure.next());
    EXPECT_TRUE(departure.finished(t0 + 10ms));
}

}  // namespace
}  // namespace sim
