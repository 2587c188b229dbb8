// What a master writes at once arrives at the line's speed. No clock: every instant is made up.
#include "sim/Receiver.h"

#include <gtest/gtest.h>

#include "wire/Lengths.h"

namespace sim {
namespace {

using namespace std::chrono_literals;
using wire::Bytes;
using wire::ByteView;
using wire::Mode;

const Bytes kRead{0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0A};
const Bytes kUnknown{0x01, 0x07, 0x41, 0xE2};

constexpr wire::LineRate kMillisecond{.baud = 10000, .characterBits = 10};  // A character.

class ReceiverTest : public testing::Test {
  protected:
    static Receiver receiver(wire::LineRate rate, Mode mode = Mode::Rtu) {
        return {mode, [](ByteView first) { return wire::lengthOfRequest(first, false); }, rate,
                20ms};
    }

    const Instant t0 = Instant(1h);
};

TEST_F(ReceiverTest, WithoutARateAFrameIsThereAtOnce) {
    Receiver ear = receiver({.baud = 0});
    EXPECT_EQ(kNever, ear.next());
    ear.add(kRead, t0);
    EXPECT_EQ(t0, ear.next());
    const auto arrival = ear.take(t0);
    ASSERT_TRUE(arrival);
    EXPECT_EQ(kRead, arrival->frame.raw);
    EXPECT_EQ(kNever, ear.next());
}

TEST_F(ReceiverTest, AFrameArrivesWithItsLastCharacter) {
    Receiver ear = receiver(kMillisecond);
    ear.add(kRead, t0);
    EXPECT_EQ(t0 + 8ms, ear.next());
    EXPECT_FALSE(ear.take(t0 + 8ms - 1ns));
    const auto arrival = ear.take(t0 + 9ms);
    ASSERT_TRUE(arrival);
    EXPECT_EQ(t0 + 8ms, arrival->at) << "a late look does not make it late";
}

TEST_F(ReceiverTest, WhatIsWrittenMeanwhileArrivesBehindIt) {
    Receiver ear = receiver(kMillisecond);
    ear.add(kRead, t0);
    ear.add(kRead, t0 + 3ms);
    ASSERT_TRUE(ear.take(t0 + 8ms));
    EXPECT_EQ(t0 + 16ms, ear.next());
}

TEST_F(ReceiverTest, AfterAPauseTheTimeCountsFromTheWriting) {
    Receiver ear = receiver(kMillisecond);
    ear.add(ByteView(kRead).first(4), t0);
    ear.add(ByteView(kRead).subspan(4), t0 + 6ms);
    EXPECT_EQ(t0 + 10ms, ear.next());
}

TEST_F(ReceiverTest, NoErrorAddsUpOverManyFrames) {
    Receiver ear = receiver({.baud = 115200, .characterBits = 10});
    for (int i = 0; i < 14400; ++i) {
        ear.add(kRead, t0);
        ear.take(kNever);
    }
    ear.add(kRead, t0);
    const auto last = ear.take(kNever);
    ASSERT_TRUE(last);
    // 14400 frames of 80 bits are 10 s; then one more.
    EXPECT_EQ(t0 + 10s + wire::timeOfCharacters(8, {.baud = 115200, .characterBits = 10}),
              last->at);
}

TEST_F(ReceiverTest, TheSilenceCountsFromTheLastCharactersArrival) {
    Receiver ear = receiver(kMillisecond);
    ear.add(kUnknown, t0);
    EXPECT_EQ(t0 + 4ms + 20ms, ear.next());
    EXPECT_FALSE(ear.take(t0 + 23ms));
    const auto arrival = ear.take(t0 + 24ms);
    ASSERT_TRUE(arrival);
    EXPECT_EQ(kUnknown, arrival->frame.raw);
    EXPECT_EQ(t0 + 24ms, arrival->at);
    EXPECT_EQ(kNever, ear.next());
}

TEST_F(ReceiverTest, AsciiWaitsForNoSilence) {
    Receiver ear = receiver(kMillisecond, Mode::Ascii);
    const std::string frame = ":010300000001FB\r\n";
    ear.add(Bytes(frame.begin(), frame.end() - 1), t0);
    EXPECT_EQ(kNever, ear.next());
    ear.add(Bytes{'\n'}, t0);
    EXPECT_EQ(t0 + 17ms, ear.next());
}

TEST_F(ReceiverTest, HasRoomForASecondOfCharacters) {
    Receiver ear = receiver(kMillisecond);
    EXPECT_LE(ear.hasRoomFrom(), t0);
    ear.add(Bytes(1000, 0), t0);
    EXPECT_LE(ear.hasRoomFrom(), t0);
    ear.add(Bytes(500, 0), t0);
    EXPECT_EQ(t0 + 500ms, ear.hasRoomFrom());
}

}  // namespace
}  // namespace sim
