#include "sim/Fault.h"

#include <gtest/gtest.h>

#include <string>

namespace sim {
namespace {

using wire::Bytes;
using wire::Mode;

const Bytes kReply{0x02, 0x07};  // Its CRC on the line is 41 12.
const Bytes kFrame{0x02, 0x07, 0x41, 0x12};

Bytes sentWith(const Fault& fault) {
    return transmit(Mode::Rtu, kReply, fault).bytes;
}

TEST(FaultTest, WithoutFaultTheFrameGoesOutInOne) {
    const Transmission sent = transmit(Mode::Rtu, kReply, Fault{});
    EXPECT_EQ(kFrame, sent.bytes);
    EXPECT_EQ(0U, sent.delayMs);
    EXPECT_EQ(0U, sent.dripBytes);
    EXPECT_FALSE(sent.hangUp);
}

TEST(FaultTest, WrongCheckSpoilsTheCheckOnly) {
    EXPECT_EQ((Bytes{0x02, 0x07, 0xBE, 0xED}), sentWith({.wrongCheck = true}));
    const Bytes ascii = transmit(Mode::Ascii, kReply, {.wrongCheck = true}).bytes;
    EXPECT_EQ(":020708\r\n", std::string(ascii.begin(), ascii.end()));
}

TEST(FaultTest, WrongNodeHasARightCheck) {
    EXPECT_EQ((Bytes{0x03, 0x07, 0x40, 0x82}), sentWith({.wrongNode = true}));
    const Bytes ascii = transmit(Mode::Ascii, kReply, {.wrongNode = true}).bytes;
    EXPECT_EQ(":0307F6\r\n", std::string(ascii.begin(), ascii.end()));
}

TEST(FaultTest, KeepCutsTheEnd) {
    EXPECT_EQ(Bytes{}, sentWith({.keep = 0}));
    EXPECT_EQ((Bytes{0x02, 0x07, 0x41}), sentWith({.keep = 3}));
    EXPECT_EQ(kFrame, sentWith({.keep = 99}));
}

TEST(FaultTest, NoiseComesBeforeAndDoesNotCountForKeep) {
    EXPECT_EQ((Bytes{0x00, 0xFF, 0x02, 0x07}), sentWith({.keep = 2, .noise = {0x00, 0xFF}}));
}

TEST(FaultTest, ReplacementIsSentAsItIs) {
    EXPECT_EQ((Bytes{1, 2, 3}), sentWith({.wrongCheck = true, .replacement = Bytes{1, 2, 3}}));
}

TEST(FaultTest, TimesArePassedOn) {
    const Transmission sent =
        transmit(Mode::Rtu, kReply, {.delayMs = 200, .dripBytes = 2, .dripGapMs = 50});
    EXPECT_EQ(kFrame, sent.bytes);
    EXPECT_EQ(200U, sent.delayMs);
    EXPECT_EQ(2U, sent.dripBytes);
    EXPECT_EQ(50U, sent.dripGapMs);
}

TEST(FaultTest, HangUpSendsWhatIsKeptOrNothing) {
    const Transmission silent = transmit(Mode::Rtu, kReply, {.hangUp = true});
    EXPECT_TRUE(silent.hangUp);
    EXPECT_TRUE(silent.bytes.empty());
    EXPECT_EQ(Bytes{0x02}, sentWith({.keep = 1, .hangUp = true}));
}

TEST(FaultTest, QueueFaultsComeDueInOrderAndCountDown) {
    FaultQueue queue;
    queue.add({.times = 2, .silent = true});
    queue.add({.wrongNode = true});
    EXPECT_TRUE(queue.take(1)->silent);
    EXPECT_TRUE(queue.take(1)->silent);
    EXPECT_TRUE(queue.take(1)->wrongNode);
    EXPECT_TRUE(queue.empty());
    EXPECT_FALSE(queue.take(1));
}

TEST(FaultTest, QueueAFaultForOneNodeLetsTheOthersPass) {
    FaultQueue queue;
    queue.add({.node = 2, .silent = true});
    EXPECT_FALSE(queue.take(1));
    EXPECT_TRUE(queue.take(2));
    EXPECT_FALSE(queue.take(2));
}

TEST(FaultTest, QueueAFaultForNobodyIsNotKept) {
    FaultQueue queue;
    queue.add({.times = 0, .silent = true});
    queue.add({.times = -1, .silent = true});
    EXPECT_TRUE(queue.empty());
}

TEST(FaultTest, QueueClearForgetsAll) {
    FaultQueue queue;
    queue.add({.times = 5, .silent = true});
    queue.clear();
    EXPECT_FALSE(queue.take(1));
}

}  // namespace
}  // namespace sim
