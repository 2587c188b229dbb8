#include "runtime/LineExchange.h"

#include <gmock/gmock.h>

#include <array>
#include <atomic>
#include <limits>
#include <memory>

#include "tests/unit/runtime/FakeLine.h"

namespace {

using namespace runtime;
using namespace std::chrono_literals;
using ::testing::ElementsAre;

constexpr Milliseconds kForEver{std::numeric_limits<int>::max()};

struct LineReceptionTest : ::testing::Test {
    FrameEnd receive(std::size_t most, Milliseconds timeout, Milliseconds gap) {
        return port.receiveFrame(std::span(buffer).first(most), timeout, gap);
    }
    std::vector<std::uint8_t> received(const FrameEnd& end) const {
        return {buffer.begin(), buffer.begin() + static_cast<std::ptrdiff_t>(end.count)};
    }

    FakeLine line;
    LineExchange port{line, {}};
    std::array<std::uint8_t, 512> buffer{};
};

TEST_F(LineReceptionTest, LimitedWaitForTheFirstByteEndsEarlyUntilTheLimitIsLifted) {
    const auto limit = std::make_shared<std::atomic<int>>(50);
    ExchangeOptions options;
    options.longestWait = limit;
    LineExchange limited(line, options);
    std::uint8_t byte = 0;
    EXPECT_EQ(Transfer::TimedOut, limited.receiveByte(byte, 1000ms));
    EXPECT_EQ(50, line.elapsedMs());
    EXPECT_EQ(Transfer::TimedOut, limited.receiveByte(byte, 20ms));
    EXPECT_EQ(70, line.elapsedMs()) << "a shorter wait stays as it is";
    *limit = 0;
    EXPECT_EQ(Transfer::TimedOut, limited.receiveByte(byte, 1000ms));
    EXPECT_EQ(1070, line.elapsedMs());
}

TEST_F(LineReceptionTest, SilenceEndsTheFrame) {
    line.arrive(1, {1});
    line.arrive(5, {2, 3});
    line.arrive(20, {4});
    const FrameEnd end = receive(512, 1000ms, 13ms);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2, 3));
    EXPECT_EQ(5 + 13, line.elapsedMs());
}

TEST_F(LineReceptionTest, PauseJustShortOfTheGapIsBridged) {
    line.arrive(0, {1});
    line.arrive(12, {2});
    line.arrive(24, {3});
    EXPECT_THAT(received(receive(512, 1000ms, 13ms)), ElementsAre(1, 2, 3));
}

TEST_F(LineReceptionTest, SilenceFromTheStartEndsAnEmptyFrame) {
    const FrameEnd end = receive(512, 1000ms, 13ms);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_EQ(0u, end.count);
    EXPECT_EQ(13, line.elapsedMs());
}

TEST_F(LineReceptionTest, MaximumEndsTheFrameAtOnce) {
    line.arrive(2, {1, 2, 3, 4, 5});
    const FrameEnd end = receive(4, kForEver, kForEver);
    EXPECT_EQ(Transfer::Complete, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2, 3, 4));
    EXPECT_EQ(2, line.elapsedMs());
}

TEST_F(LineReceptionTest, BytesBeyondTheMaximumStayForTheNextRead) {
    line.arrive(0, {1, 2, 3});
    EXPECT_THAT(received(receive(2, 1000ms, 10ms)), ElementsAre(1, 2));
    EXPECT_THAT(received(receive(2, 1000ms, 10ms)), ElementsAre(3));
}

TEST_F(LineReceptionTest, NoRoomReadsNothingAndDoesNotWait) {
    line.arrive(0, {1});
    const FrameEnd end = receive(0, kForEver, kForEver);
    EXPECT_EQ(0u, end.count);
    EXPECT_EQ(0, line.waits());
}

TEST_F(LineReceptionTest, DeadlineEndsTheFrameBeforeTheGap) {
    line.arrive(10, {1});
    const FrameEnd end = receive(512, 50ms, 800ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_THAT(received(end), ElementsAre(1));
    EXPECT_EQ(50, line.elapsedMs());
}

TEST_F(LineReceptionTest, DripsForEverAreBoundedByTheOneDeadline) {
    line.drip(7);
    const FrameEnd end = receive(512, 100ms, 13ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_EQ(100u / 7u, end.count);
    EXPECT_EQ(100, line.elapsedMs());
}

TEST_F(LineReceptionTest, DeadlineHoldsAlsoWhenEveryReadIsSlow) {
    line.drip(1);
    line.readSlowly(30);
    const FrameEnd end = receive(512, 100ms, 1000ms);
    EXPECT_EQ(Transfer::TimedOut, end.how);
    EXPECT_GT(end.count, 0u);
    EXPECT_LE(line.elapsedMs(), 100 + 30);
}

TEST_F(LineReceptionTest, WaitingBytesAreTakenBeforeSilenceIsJudged) {
    // The process slept through the whole frame; the bytes lie in the kernel.
    line.arrive(0, {1, 2, 3});
    line.sleepUntil(line.now() + 500ms);
    EXPECT_THAT(received(receive(512, 1000ms, 2ms)), ElementsAre(1, 2, 3));
}

TEST_F(LineReceptionTest, TimeoutOfZeroTakesWhatIsThere) {
    line.arrive(0, {1, 2});
    line.arrive(1, {3});
    EXPECT_THAT(received(receive(512, 0ms, 13ms)), ElementsAre(1, 2));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(LineReceptionTest, NegativeTimesCountAsZero) {
    line.arrive(0, {1, 2});
    EXPECT_THAT(received(receive(512, -5ms, -5ms)), ElementsAre(1, 2));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(LineReceptionTest, VanishedLineFailsAtOnceAndKeepsWhatCame) {
    line.arrive(3, {1, 2});
    line.vanish(6);
    const FrameEnd end = receive(512, kForEver, kForEver);
    EXPECT_EQ(Transfer::Gone, end.how);
    EXPECT_THAT(received(end), ElementsAre(1, 2));
    EXPECT_EQ(6, line.elapsedMs());
}

TEST_F(LineReceptionTest, LineThatWasGoneBeforeCostsOneQuestion) {
    line.vanish(0);
    EXPECT_EQ(Transfer::Gone, receive(512, kForEver, kForEver).how);
    EXPECT_EQ(1, line.waits());
}

TEST_F(LineReceptionTest, EndFoundByTheReadItselfIsGone) {
    line.arrive(4, {1});
    line.readSlowly(2);
    line.vanish(5);
    EXPECT_EQ(Transfer::Gone, receive(512, kForEver, kForEver).how);
}

TEST_F(LineReceptionTest, FirstByteArrivesInTime) {
    line.arrive(40, {0xAB, 0xCD});
    std::uint8_t byte = 0;
    EXPECT_EQ(Transfer::Complete, port.receiveByte(byte, 2000ms));
    EXPECT_EQ(0xAB, byte);
    EXPECT_EQ(40, line.elapsedMs());
    EXPECT_EQ(Transfer::Complete, port.receiveByte(byte, 0ms));
    EXPECT_EQ(0xCD, byte);
}

TEST_F(LineReceptionTest, TimeoutLeavesTheFirstByteUntouched) {
    line.arrive(41, {0xAB});
    std::uint8_t byte = 0x11;
    EXPECT_EQ(Transfer::TimedOut, port.receiveByte(byte, 40ms));
    EXPECT_EQ(0x11, byte);
    EXPECT_EQ(40, line.elapsedMs());
}

TEST_F(LineReceptionTest, TimeoutOfZeroOnlyLooksForTheFirstByte) {
    std::uint8_t byte = 0;
    EXPECT_EQ(Transfer::TimedOut, port.receiveByte(byte, 0ms));
    EXPECT_EQ(Transfer::TimedOut, port.receiveByte(byte, -3ms));
    EXPECT_EQ(0, line.elapsedMs());
}

TEST_F(LineReceptionTest, VanishedLineFailsTheFirstByteAtOnce) {
    line.vanish(10);
    std::uint8_t byte = 0x11;
    EXPECT_EQ(Transfer::Gone, port.receiveByte(byte, kForEver));
    EXPECT_EQ(0x11, byte);
    EXPECT_EQ(10, line.elapsedMs());
}

}  // namespace
