#include <gtest/gtest.h>

#include <numeric>

#include "runtime/LineTransfer.h"
#include "tests/unit/runtime/FakeLine.h"

namespace {

using namespace runtime;
using namespace std::chrono_literals;

struct LineSendingTest : ::testing::Test {
    LineSendingTest() { std::iota(data.begin(), data.end(), std::uint8_t{0}); }
    Line::TimePoint deadline() { return line.now() + sendingTime(data.size(), 1ms); }
    Transfer send() { return sendAll(line, data, deadline()); }
    Transfer sendAndDrain() {
        const Transfer sent = send();
        return sent == Transfer::Complete ? drain(line, deadline(), 1ms) : sent;
    }

    FakeLine line;
    std::vector<std::uint8_t> data = std::vector<std::uint8_t>(100);
};

TEST_F(LineSendingTest, SendsTheWholeBuffer) {
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(data, line.sent());
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(LineSendingTest, RoomIsAskedForOnlyAfterAShortWrite) {
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(0, line.waits());
}

TEST_F(LineSendingTest, OneByteAtATimeIsEnough) {
    line.takeSlowly(1, 1);
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(data, line.sent());
}

TEST_F(LineSendingTest, LineThatCannotTellWhatIsUnsentHasSentIt) {
    EXPECT_EQ(Transfer::Complete, drain(line, deadline(), 1ms));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(LineSendingTest, ShortWritesAreContinued) {
    line.takeSlowly(7, 3);
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(data, line.sent());
    EXPECT_FALSE(line.outputDiscarded());
}

TEST_F(LineSendingTest, DrainedWhenTheLastByteIsOnTheWire) {
    line.transmitSlowly(2);
    EXPECT_EQ(Transfer::Complete, sendAndDrain());
    EXPECT_EQ(200, line.elapsedMs());
}

TEST_F(LineSendingTest, DeadlineIsTheCharactersTimeAndAMargin) {
    line.jam();
    EXPECT_EQ(Transfer::TimedOut, send());
    EXPECT_EQ(100 + 1000, line.elapsedMs());
    EXPECT_TRUE(line.outputDiscarded());
}

TEST_F(LineSendingTest, QueueThatDoesNotDrainInTimeFailsAndIsThrownAway) {
    line.transmitSlowly(50);
    EXPECT_EQ(Transfer::TimedOut, sendAndDrain());
    EXPECT_EQ(100 + 1000, line.elapsedMs());
    EXPECT_TRUE(line.outputDiscarded());
}

TEST_F(LineSendingTest, VanishedLineFailsAtOnce) {
    line.takeSlowly(10, 20);
    line.vanish(30);
    EXPECT_EQ(Transfer::Gone, send());
    EXPECT_EQ(30, line.elapsedMs());
}

TEST_F(LineSendingTest, NothingToSendIsDone) {
    data.clear();
    line.jam();
    EXPECT_EQ(Transfer::Complete, send());
}

TEST_F(LineSendingTest, TimeFollowsFromRateAndFormat) {
    EXPECT_EQ(1041667ns, characterTime(9600, 10));
    EXPECT_EQ(80ms, characterTime(150, 12));
    EXPECT_EQ(256 * 66666667ns + 1s, sendingTime(256, characterTime(150, 10)));
}

}  // namespace
