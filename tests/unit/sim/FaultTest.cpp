#include "sim/Fault.h"

#include <gtest/gtest.h>

#include <string>

namespace sim {
namespace {

const Bytes kReply{0x02, 0x07};  // Its CRC on the line is 41 12.
const Bytes kFrame{0x02, 0x07, 0x41, 0x12};

Bytes sentWith(const Fault& fault) {
    return transmit(Mode::rtu, kReply, fault).bytes;
}

TEST(TransmitTest, WithoutFaultTheFrameGoesOutInOne) {
    const Transmission sent = transmit(Mode::rtu, kReply, Fault{});
    EXPECT_EQ(sent.bytes, kFrame);
    EXPECT_EQ(sent.delayMs, 0U);
    EXPECT_EQ(sent.dripBytes, 0U);
    EXPECT_FALSE(sent.hangUp);
}

TEST(TransmitTest, WrongCheckSpoilsTheCheckOnly) {
    EXPECT_EQ(sentWith({.wrongCheck = true}), (Bytes{0x02, 0x07, 0xBE, 0xED}));
    const Bytes ascii = transmit(Mode::ascii, kReply, {.wrongCheck = true}).bytes;
    EXPECT_EQ(std::string(ascii.begin(), ascii.end()), ":020708\r\n");
}

TEST(TransmitTest, WrongNodeHasARightCheck) {
    EXPECT_EQ(sentWith({.wrongNode = true}), (Bytes{0x03, 0x07, 0x40, 0x82}));
    const Bytes ascii = transmit(Mode::ascii, kReply, {.wrongNode = true}).bytes;
    EXPECT_EQ(std::string(ascii.begin(), ascii.end()), ":0307F6\r\n");
}

TEST(TransmitTest, KeepCutsTheEnd) {
    EXPECT_EQ(sentWith({.keep = 0}), Bytes{});
    EXPECT_EQ(sentWith({.keep = 3}), (Bytes{0x02, 0x07, 0x41}));
    EXPECT_EQ(sentWith({.keep = 99}), kFrame);
}

TEST(TransmitTest, NoiseComesBeforeAndDoesNotCountForKeep) {
    EXPECT_EQ(sentWith({.keep = 2, .noise = {0x00, 0xFF}}), (Bytes{0x00, 0xFF, 0x02, 0x07}));
}

TEST(TransmitTest, ReplacementIsSentAsItIs) {
    EXPECT_EQ(sentWith({.wrongCheck = true, .replacement = Bytes{1, 2, 3}}), (Bytes{1, 2, 3}));
}

TEST(TransmitTest, TimesArePassedOn) {
    const Transmission sent =
        transmit(Mode::rtu, kReply, {.delayMs = 200, .dripBytes = 2, .dripGapMs = 50});
    EXPECT_EQ(sent.bytes, kFrame);
    EXPECT_EQ(sent.delayMs, 200U);
    EXPECT_EQ(sent.dripBytes, 2U);
    EXPECT_EQ(sent.dripGapMs, 50U);
}

TEST(TransmitTest, HangUpSendsWhatIsKeptOrNothing) {
    const Transmission silent = transmit(Mode::rtu, kReply, {.hangUp = true});
    EXPECT_TRUE(silent.hangUp);
    EXPECT_TRUE(silent.bytes.empty());
    EXPECT_EQ(sentWith({.keep = 1, .hangUp = true}), Bytes{0x02});
}

TEST(FaultQueueTest, FaultsComeDueInOrderAndCountDown) {
    FaultQueue queue;
    queue.add({.times = 2, .silent = true});
    queue.add({.wrongNode = true});
    EXPECT_TRUE(queue.take(1)->silent);
    EXPECT_TRUE(queue.take(1)->silent);
    EXPECT_TRUE(queue.take(1)->wrongNode);
    EXPECT_TRUE(queue.empty());
    EXPECT_FALSE(queue.take(1));
}

TEST(FaultQueueTest, AFaultForOneNodeLetsTheOthersPass) {
    FaultQueue queue;
    queue.add({.node = 2, .silent = true});
    EXPECT_FALSE(queue.take(1));
    EXPECT_TRUE(queue.take(2));
    EXPECT_FALSE(queue.take(2));
}

TEST(FaultQueueTest, AFaultForNobodyIsNotKept) {
    FaultQueue queue;
    queue.add({.times = 0, .silent = true});
    queue.add({.times = -1, .silent = true});
    EXPECT_TRUE(queue.empty());
}

TEST(FaultQueueTest, ClearForgetsAll) {
    FaultQueue queue;
    queue.add({.times = 5, .silent = true});
    queue.clear();
    EXPECT_FALSE(queue.take(1));
}

}  // namespace
}  // namespace sim
