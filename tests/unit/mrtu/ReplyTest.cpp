// The checks of an accepted frame: one test a rule, one for each pair of neighbours.
#include "mrtu/Reply.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "tests/support/Bytes.h"

namespace {

using testing_support::Bytes;
using testing_support::hex;

_MRTU::Message message(const std::string& bytes) {
    _MRTU::Message result;
    for (const std::uint8_t byte : hex(bytes))
        result.put(byte);
    return result;
}

/// The frame of a body; two zeroes stand for the check, which nobody looks at any more.
_MRTU::Reply reply(const std::string& bytes, int checkLength = 2) {
    _MRTU::Reply result;
    const Bytes body = hex(bytes);
    std::copy(body.begin(), body.end(), result.bytes.begin());
    result.length = static_cast<int>(body.size()) + checkLength;
    result.checkLength = checkLength;
    return result;
}

void expectFault(int code, const std::string& text, const _MRTU::Fault& fault) {
    EXPECT_EQ(code, fault.code);
    EXPECT_EQ(text, fault.text);
}

const char* const kNodeText = "Incorrect node address in response";
const char* const kOperationText = "Incorrect operation in response";
const char* const kLengthText = "Incorrect data length received";
const char* const kOffsetText = "Incorrect offset in response";
const char* const kCountText = "Incorrect count in response";
const char* const kAcknowledgeText = "Incorrect writing data acknowledge";

TEST(CommonCheckTest, RightNodeAndFunctionPass) {
    EXPECT_FALSE(checkCommon(message("01 03 00 00 00 01"), reply("01 03 02 00 00")));
}

TEST(CommonCheckTest, NodeMustMatch) {
    expectFault(-6, kNodeText, checkCommon(message("01 03 00 00 00 01"), reply("02 03 02 00 00")));
}

TEST(CommonCheckTest, ExceptionIsReportedWithItsText) {
    expectFault(-6, "Exception: Illegal data address",
                checkCommon(message("01 03 00 00 00 01"), reply("01 83 02")));
    expectFault(-6, "Unknown exception",
                checkCommon(message("01 03 00 00 00 01"), reply("01 83 07")));
}

TEST(CommonCheckTest, FunctionMustMatch) {
    expectFault(-6, kOperationText,
                checkCommon(message("01 03 00 00 00 01"), reply("01 04 02 00 00")));
}

TEST(CommonCheckTest, ExceptionOfAnotherFunctionIsAWrongOperation) {
    expectFault(-6, kOperationText, checkCommon(message("01 03 00 00 00 01"), reply("01 84 02")));
}

TEST(CommonCheckTest, NodeIsReportedBeforeException) {
    expectFault(-6, kNodeText, checkCommon(message("01 03 00 00 00 01"), reply("02 83 02")));
}

TEST(CommonCheckTest, NodeIsReportedBeforeFunction) {
    expectFault(-6, kNodeText, checkCommon(message("01 03 00 00 00 01"), reply("02 04 02")));
}

TEST(ReadCheckTest, LengthAndByteCountMustMatch) {
    EXPECT_FALSE(checkReadBody(reply("01 03 02 12 34"), 2));
    EXPECT_FALSE(checkReadBody(reply("01 03 02 12 34", 1), 2));
    expectFault(-6, kLengthText, checkReadBody(reply("01 03 02 12 34 56"), 2));
    expectFault(-6, kLengthText, checkReadBody(reply("01 03 02 12"), 2));
    expectFault(-6, kLengthText, checkReadBody(reply("01 03 03 12 34"), 2));
    expectFault(-6, kLengthText, checkReadBody(reply("01 03 00"), 2));
}

TEST(ReadCheckTest, CheckOfTheOtherModeMakesTheLengthWrong) {
    _MRTU::Reply frame = reply("01 03 02 12 34", 2);
    frame.checkLength = 1;
    expectFault(-6, kLengthText, checkReadBody(frame, 2));
}

TEST(ReadCheckTest, NoDataAtAllIsALengthToo) {
    EXPECT_FALSE(checkReadBody(reply("01 03 00"), 0));
    expectFault(-6, kLengthText, checkReadBody(reply("01 03 01"), 0));
}

TEST(ReadCheckTest, ProductAboveTwoHundredFiftyFiveNeverMatches) {
    _MRTU::Reply frame = reply("01 03 00");
    for (const int dataLength : {256, 512, 1024}) {
        frame.length = dataLength + 3 + 2;
        expectFault(-6, kLengthText, checkReadBody(frame, dataLength));
    }
}

TEST(WriteCheckTest, MatchingAcknowledgementsPass) {
    EXPECT_FALSE(checkWriteBody(message("01 06 00 10 12 34"), reply("01 06 00 10 12 34")));
    EXPECT_FALSE(checkWriteBody(message("01 05 00 10 FF 00"), reply("01 05 00 10 FF 00")));
    EXPECT_FALSE(
        checkWriteBody(message("01 10 00 10 00 02 04 00 01 00 02"), reply("01 10 00 10 00 02")));
    EXPECT_FALSE(checkWriteBody(message("01 0F 00 10 00 03 01 05"), reply("01 0F 00 10 00 03")));
}

TEST(WriteCheckTest, OffsetMustMatchInBothBytes) {
    for (const char* function : {"05", "06", "0F", "10"}) {
        const std::string head = std::string("01 ") + function;
        const auto request = message(head + " 12 34 FF 00");
        expectFault(-6, kOffsetText, checkWriteBody(request, reply(head + " 13 34 FF 00")));
        expectFault(-6, kOffsetText, checkWriteBody(request, reply(head + " 12 35 FF 00")));
    }
}

TEST(WriteCheckTest, SingleWritesEchoTheirValue) {
    for (const char* function : {"05", "06"}) {
        const std::string head = std::string("01 ") + function + " 00 10 ";
        const auto request = message(head + "FF 00");
        expectFault(-6, kAcknowledgeText, checkWriteBody(request, reply(head + "FE 00")));
        expectFault(-6, kAcknowledgeText, checkWriteBody(request, reply(head + "FF 01")));
    }
}

TEST(WriteCheckTest, BlockWritesTellTheirCount) {
    for (const char* function : {"0F", "10"}) {
        const std::string head = std::string("01 ") + function + " 00 10 ";
        const auto request = message(head + "01 02 04");
        expectFault(-6, kCountText, checkWriteBody(request, reply(head + "00 02")));
        expectFault(-6, kCountText, checkWriteBody(request, reply(head + "01 03")));
    }
}

TEST(WriteCheckTest, OffsetIsReportedBeforeAcknowledge) {
    expectFault(-6, kOffsetText,
                checkWriteBody(message("01 06 00 10 12 34"), reply("01 06 00 11 12 35")));
}

TEST(WriteCheckTest, OffsetIsReportedBeforeCount) {
    expectFault(-6, kOffsetText,
                checkWriteBody(message("01 10 00 10 00 01 02 00 00"), reply("01 10 00 11 00 02")));
}

TEST(WriteCheckTest, OnlyTwoEchoedBytesAreCompared) {
    EXPECT_FALSE(checkWriteBody(message("01 06 00 10 11 22 33 44"), reply("01 06 00 10 11 22")));
    EXPECT_FALSE(
        checkWriteBody(message("01 06 00 10 11 22 33 44"), reply("01 06 00 10 11 22 00 00")));
}

TEST(FaultTextTest, CodesAndTexts) {
    expectFault(-1, "Can't open serial port", _MRTU::kCannotOpen);
    expectFault(-3, "Protocol not started", _MRTU::kNotStarted);
    expectFault(-4, "No response", _MRTU::kNoResponse);
    expectFault(-6, "The received message too short", _MRTU::kTooShort);
    expectFault(-6, "Incorrect response checksum", _MRTU::kChecksum);
    expectFault(-10, "Node disabled", _MRTU::kNodeDisabled);
    expectFault(-10, "Broadcast request", _MRTU::kBroadcast);
    EXPECT_EQ(0, _MRTU::kNoFault.code);
}

}  // namespace
