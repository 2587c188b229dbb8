#include "runtime/ModbusReplies.h"

#include <gtest/gtest.h>

#include "tests/support/AllocationCounter.h"
#include "wire/Framing.h"

namespace runtime {
namespace {

using std::chrono::nanoseconds;
using wire::Bytes;
using wire::encodeFrame;
using wire::Mode;

constexpr Mode kModes[] = {Mode::Rtu, Mode::Ascii};

const Bytes kRead{17, 3, 0, 0x6B, 0, 1};
const Bytes kReply{17, 3, 2, 0x12, 0x34};
const Bytes kRtu = encodeFrame(Mode::Rtu, kRead);
const Bytes kAscii = encodeFrame(Mode::Ascii, kRead);

TEST(ModbusRepliesTest, TheAddresseeIsTheNode) {
    const ModbusReplies rules;
    EXPECT_EQ(17, rules.addressee(kRtu));
    EXPECT_EQ(17, rules.addressee(kAscii));
}

TEST(ModbusRepliesTest, NobodyAnswersABroadcastOrWhatIsNoRequest) {
    const ModbusReplies rules;
    const Bytes broadcast{0, 6, 0, 1, 0, 3};
    for (const Mode mode : kModes) {
        EXPECT_EQ(std::nullopt, rules.addressee(encodeFrame(mode, broadcast)));
        EXPECT_EQ(std::nullopt, rules.addressee(encodeFrame(mode, kRead, true)));
    }
    EXPECT_EQ(std::nullopt, rules.addressee({}));
}

TEST(ModbusRepliesTest, WhatIsNoRequestHasNoReply) {
    const ModbusReplies rules;
    const Bytes none{1, 2, 3};
    EXPECT_EQ(0U, rules.replyLength(none, {}));
    EXPECT_FALSE(rules.isWhole(none, none));
    EXPECT_EQ(Answer::No, rules.answers(none, none));
    EXPECT_FALSE(rules.confusable(none, none));
    EXPECT_FALSE(rules.confusable(kRtu, none));
    EXPECT_FALSE(rules.confusable(none, kRtu));
}

TEST(ModbusRepliesTest, AReplyIsExpectedWholeAndRecognised) {
    const ModbusReplies rules;
    for (const Mode mode : kModes) {
        const Bytes request = encodeFrame(mode, kRead);
        const Bytes reply = encodeFrame(mode, kReply);
        const ByteView half = ByteView(reply).first(reply.size() / 2);
        EXPECT_EQ(reply.size(), rules.replyLength(request, half));
        EXPECT_FALSE(rules.isWhole(request, half));
        EXPECT_TRUE(rules.isWhole(request, reply));
        EXPECT_EQ(Answer::Yes, rules.answers(request, reply));
        EXPECT_EQ(Answer::Damaged, rules.answers(request, encodeFrame(mode, kReply, true)));
        EXPECT_EQ(Answer::No, rules.answers(request, half));
    }
}

TEST(ModbusRepliesTest, TheRequestTellsTheFramingOfItsReply) {
    const ModbusReplies rules;
    EXPECT_EQ(Answer::No, rules.answers(kRtu, encodeFrame(Mode::Ascii, kReply)));
    EXPECT_EQ(Answer::No, rules.answers(kAscii, encodeFrame(Mode::Rtu, kReply)));
}

TEST(ModbusRepliesTest, RequestsOfOneKindCanBeConfused) {
    const ModbusReplies rules;
    for (const Mode mode : kModes) {
        const Bytes request = encodeFrame(mode, kRead);
        EXPECT_TRUE(rules.confusable(request, encodeFrame(mode, Bytes{17, 3, 9, 9, 0, 1})));
        EXPECT_FALSE(rules.confusable(request, encodeFrame(mode, Bytes{17, 3, 9, 9, 0, 3})));
        EXPECT_FALSE(rules.confusable(request, encodeFrame(mode, Bytes{18, 3, 9, 9, 0, 1})));
    }
    EXPECT_FALSE(rules.confusable(kRtu, kAscii));
}

TEST(ModbusRepliesTest, OnlyRtuNeedsSilence) {
    const ModbusReplies rules;
    EXPECT_EQ(nanoseconds(4'010'417), rules.silence(kRtu, 9600, 11));
    EXPECT_EQ(nanoseconds(3'645'834), rules.silence(kRtu, 9600, 10));
    EXPECT_EQ(nanoseconds(1'750'000), rules.silence(kRtu, 115200, 11));
    EXPECT_EQ(nanoseconds(4'010'417), rules.silence({}, 9600, 11));
    EXPECT_EQ(nanoseconds(0), rules.silence(kAscii, 9600, 10));
}

TEST(ModbusRepliesTest, NoQuestionTakesMemory) {
    const ModbusReplies rules;
    for (const Mode mode : kModes) {
        const Bytes request = encodeFrame(mode, kRead);
        const Bytes reply = encodeFrame(mode, kReply);
        const testing_support::AllocationCounter counter;
        rules.addressee(request);
        rules.replyLength(request, reply);
        rules.isWhole(request, reply);
        rules.answers(request, reply);
        rules.confusable(request, request);
        rules.silence(request, 9600, 11);
        EXPECT_EQ(0U, counter.allocations());
    }
}

}  // namespace
}  // namespace runtime
