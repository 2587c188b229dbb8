#include "runtime/LineTransfer.h"

#include <gmock/gmock.h>

#include <array>
#include <limits>
#include <numeric>

#include "tests/unit/runtime/FakeLine.h"

namespace {

using namespace runtime;
using namespace std::chrono_literals;
using ::testing::ElementsAre;

constexpr Milliseconds kForEver{std::numeric_limits<int>::max()};

struct FrameTest : ::testing::Test {
    FrameEnd receive(std::size_t most, Milliseconds timeout, Milliseconds gap) {
        return receiveRest(line, std::span(buffer).first(most), timeout, gap);
    }
    std::vector<std::uint8_t> received(const FrameEnd& end) const {
        return {buffer.begin(), buffer.begin() + static_cast<std::ptrdiff_t>(end.count)};
    }

    FakeLine line;
    std::array<std::uint8_t, 512> buffer{};
};

TEST_F(FrameTest, SilenceEndsTheFrame) {
    line.arrive(1, {1});
    line.arrive(5, {2, 3});
    line.arrive(20, {4});
    const FrameEnd end = receive(512, 1000ms, 13ms);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2, 3));
    EXPECT_EQ(5 + 13, line.elapsedMs());
}

TEST_F(FrameTest, PauseJustShortOfTheGapIsBridged) {
    line.arrive(0, {1});
    line.arrive(12, {2});
    line.arrive(24, {3});
    EXPECT_THAT(received(receive(512, 1000ms, 13ms)), ElementsAre(1, 2, 3));
}

TEST_F(FrameTest, SilenceFromTheStartEndsAnEmptyFrame) {
    const FrameEnd end = receive(512, 1000ms, 13ms);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_EQ(0u, end.count);
    EXPECT_EQ(13, line.elapsedMs());
}

TEST_F(FrameTest, MaximumEndsTheFrameAtOnce) {
    line.arrive(2, {1, 2, 3, 4, 5});
    const FrameEnd end = receive(4, kForEver, kForEver);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2, 3, 4));
    EXPECT_EQ(2, line.elapsedMs());
}

TEST_F(FrameTest, BytesBeyondTheMaximumStayForTheNextRead) {
    line.arrive(0, {1, 2, 3});
    EXPECT_THAT(received(receive(2, 1000ms, 10ms)), ElementsAre(1, 2));
    EXPECT_THAT(received(receive(2, 1000ms, 10ms)), ElementsAre(3));
}

TEST_F(FrameTest, NoRoomReadsNothingAndDoesNotWait) {
    line.arrive(0, {1});
    const FrameEnd end = receive(0, kForEver, kForEver);
    EXPECT_EQ(0u, end.count);
    EXPECT_EQ(0, line.waits());
}

TEST_F(FrameTest, DeadlineEndsTheFrameBeforeTheGap) {
    line.arrive(10, {1});
    const FrameEnd end = receive(512, 50ms, 800ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_THAT(received(end), ElementsAre(1));
    EXPECT_EQ(50, line.elapsedMs());
}

TEST_F(FrameTest, DripsForEverAreBoundedByTheOneDeadline) {
    line.drip(7);
    const FrameEnd end = receive(512, 100ms, 13ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_EQ(100u / 7u, end.count);
    EXPECT_EQ(100, line.elapsedMs());
}

TEST_F(FrameTest, DeadlineHoldsAlsoWhenEveryReadIsSlow) {
    line.drip(1);
    line.readSlowly(30);
    const FrameEnd end = receive(512, 100ms, 1000ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_GT(end.count, 0u);
    EXPECT_LE(line.elapsedMs(), 100 + 30);
}

TEST_F(FrameTest, WaitingBytesAreTakenBeforeSilenceIsJudged) {
    // The process slept through the whole frame; the bytes lie in the kernel.
    line.arrive(0, {1, 2, 3});
    line.sleepUntil(line.now() + 500ms);
    EXPECT_THAT(received(receive(512, 1000ms, 2ms)), ElementsAre(1, 2, 3));
}

TEST_F(FrameTest, TimeoutOfZeroTakesWhatIsThere) {
    line.arrive(0, {1, 2});
    line.arrive(1, {3});
    EXPECT_THAT(received(receive(512, 0ms, 13ms)), ElementsAre(1, 2));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(FrameTest, NegativeTimesCountAsZero) {
    line.arrive(0, {1, 2});
    EXPECT_THAT(received(receive(512, -5ms, -5ms)), ElementsAre(1, 2));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(FrameTest, VanishedLineFailsAtOnceAndKeepsWhatCame) {
    line.arrive(3, {1, 2});
    line.vanish(6);
    const FrameEnd end = receive(512, kForEver, kForEver);
    EXPECT_EQ(Transfer::Gone, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2));
    EXPECT_EQ(6, line.elapsedMs());
}

TEST_F(FrameTest, LineThatWasGoneBeforeCostsOneQuestion) {
    line.vanish(0);
    EXPECT_EQ(Transfer::Gone, receive(512, kForEver, kForEver).how);
    EXPECT_EQ(1, line.waits());
}

TEST_F(FrameTest, EndFoundByTheReadItselfIsGone) {
    line.arrive(4, {1});
    line.readSlowly(2);
    line.vanish(5);
    EXPECT_EQ(Transfer::Gone, receive(512, kForEver, kForEver).how);
}

TEST(FirstByte, ArrivesInTime) {
    FakeLine line;
    line.arrive(40, {0xAB, 0xCD});
    std::uint8_t byte = 0;
    EXPECT_EQ(Transfer::Complete, receiveOne(line, byte, 2000ms));
    EXPECT_EQ(0xAB, byte);
    EXPECT_EQ(40, line.elapsedMs());
    EXPECT_EQ(Transfer::Complete, receiveOne(line, byte, 0ms));
    EXPECT_EQ(0xCD, byte);
}

TEST(FirstByte, TimeoutLeavesTheByteUntouched) {
    FakeLine line;
    line.arrive(41, {0xAB});
    std::uint8_t byte = 0x11;
    EXPECT_EQ(Transfer::TimedOut, receiveOne(line, byte, 40ms));
    EXPECT_EQ(0x11, byte);
    EXPECT_EQ(40, line.elapsedMs());
}

TEST(FirstByte, TimeoutOfZeroOnlyLooks) {
    FakeLine line;
    std::uint8_t byte = 0;
    EXPECT_EQ(Transfer::TimedOut, receiveOne(line, byte, 0ms));
    EXPECT_EQ(Transfer::TimedOut, receiveOne(line, byte, -3ms));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST(FirstByte, VanishedLineFailsAtOnce) {
    FakeLine line;
    line.vanish(10);
    std::uint8_t byte = 0x11;
    EXPECT_EQ(Transfer::Gone, receiveOne(line, byte, kForEver));
    EXPECT_EQ(0x11, byte);
    EXPECT_EQ(10, line.elapsedMs());
}

struct SendTest : ::testing::Test {
    SendTest() { std::iota(data.begin(), data.end(), std::uint8_t{0}); }
    Transfer send() { return sendAll(line, data, sendingTime(data.size(), 1ms), 1ms); }

    FakeLine line;
    std::vector<std::uint8_t> data = std::vector<std::uint8_t>(100);
};

TEST_F(SendTest, SendsTheWholeBuffer) {
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(data, line.sent());
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(SendTest, ShortWritesAreContinued) {
    line.takeSlowly(7, 3);
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(data, line.sent());
    EXPECT_FALSE(line.outputDiscarded());
}

TEST_F(SendTest, ReturnsWhenTheLastByteIsOnTheWire) {
    line.transmitSlowly(2);
    EXPECT_EQ(Transfer::Complete, send());
    EXPECT_EQ(200, line.elapsedMs());
}

TEST_F(SendTest, DeadlineIsTheCharactersTimeAndAMargin) {
    line.jam();
    EXPECT_EQ(Transfer::TimedOut, send());
    EXPECT_EQ(100 + 1000, line.elapsedMs());
    EXPECT_TRUE(line.outputDiscarded());
}

TEST_F(SendTest, QueueThatDoesNotDrainInTimeFailsAndIsThrownAway) {
    line.transmitSlowly(50);
    EXPECT_EQ(Transfer::TimedOut, send());
    EXPECT_EQ(100 + 1000, line.elapsedMs());
    EXPECT_TRUE(line.outputDiscarded());
}

TEST_F(SendTest, VanishedLineFailsAtOnce) {
    line.takeSlowly(10, 20);
    line.vanish(30);
    EXPECT_EQ(Transfer::Gone, send());
    EXPECT_EQ(30, line.elapsedMs());
}

TEST_F(SendTest, NothingToSendIsDone) {
    data.clear();
    line.jam();
    EXPECT_EQ(Transfer::Complete, send());
}

TEST(SendingTime, FollowsFromRateAndFormat) {
    EXPECT_EQ(1041666ns, characterTime(9600, 10));
    EXPECT_EQ(80ms, characterTime(150, 12));
    EXPECT_EQ(256 * 66666666ns + 1s, sendingTime(256, characterTime(150, 10)));
}

}  // namespace
