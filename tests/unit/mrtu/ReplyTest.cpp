// The list of checks of a reply: one test a rule, one for each pair of neighbours.
#include "mrtu/Reply.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <string>

#include "tests/support/ByteTexts.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;
using testing_support::hex;

_MRTU::Message message(const std::string& bytes) {
    _MRTU::Message result;
    for (const std::uint8_t byte : hex(bytes))
        result.put(byte);
    return result;
}

/// The accepted frame of a body; two zeroes stand for the check, which nobody looks at any more.
_MRTU::Reply reply(const std::string& bytes, int checkLength = 2) {
    _MRTU::Reply result;
    const Bytes body = hex(bytes);
    std::copy(body.begin(), body.end(), result.bytes.begin());
    result.length = static_cast<int>(body.size()) + checkLength;
    result.checkLength = checkLength;
    result.received = result.length;
    result.accepted = true;
    return result;
}

/// The same after attempts that brought no good frame, `received` bytes in the last of them.
_MRTU::Reply refused(const std::string& bytes, int received) {
    _MRTU::Reply result = reply(bytes);
    result.received = received;
    result.accepted = false;
    return result;
}

/// What is said about a reply to a read of `dataLength` bytes, or to a write.
_MRTU::Fault checkRead(const _MRTU::Reply& reply, long long dataLength) {
    return checkReply(message("01 03 00 00 00 01"), reply, dataLength);
}

_MRTU::Fault checkWrite(const _MRTU::Message& request, const _MRTU::Reply& reply) {
    return checkReply(request, reply, 0);
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

TEST(ReplyTest, NothingReceivedIsNoResponse) {
    expectFault(-4, "No response", checkRead(_MRTU::Reply(), 2));
}

TEST(ReplyTest, LessThanFiveBytesAreTooShort) {
    for (int received = 1; received < 5; ++received)
        expectFault(-6, "The received message too short", checkRead(refused("", received), 2));
}

TEST(ReplyTest, FiveBytesAreLookedAtForTheirCheckSum) {
    expectFault(-6, "Incorrect response checksum", checkRead(refused("01 83 02", 5), 2));
}

TEST(ReplyTest, RightCheckSumAfterAllLetsTheFramePass) {
    _MRTU::Reply frame = refused("01 03 02 12 34", 7);
    const Bytes crc = testing_support::crcOf(hex("01 03 02 12 34"));
    std::copy(crc.begin(), crc.end(), frame.bytes.begin() + 5);
    EXPECT_FALSE(checkRead(frame, 2));
}

TEST(ReplyTest, OnlyTheLastAttemptDecidesWhatIsMissing) {
    // A whole frame lies in the buffer from an earlier attempt.
    expectFault(-4, "No response", checkRead(refused("01 03 02 12 34", 0), 2));
    expectFault(-6, "The received message too short", checkRead(refused("01 03 02 12 34", 4), 2));
}

TEST(ReplyTest, TooShortIsReportedBeforeCheckSum) {
    expectFault(-6, "The received message too short", checkRead(refused("01 83", 4), 2));
}

TEST(ReplyTest, CheckSumIsReportedBeforeNode) {
    expectFault(-6, "Incorrect response checksum", checkRead(refused("02 03 02 12 34", 7), 2));
}

TEST(ReplyTest, RightNodeAndFunctionPass) {
    EXPECT_FALSE(checkRead(reply("01 03 02 00 00"), 2));
}

TEST(ReplyTest, NodeMustMatch) {
    expectFault(-6, kNodeText, checkRead(reply("02 03 02 00 00"), 2));
}

TEST(ReplyTest, ExceptionIsReportedWithItsText) {
    expectFault(-6, "Exception: Illegal data address", checkRead(reply("01 83 02"), 2));
    expectFault(-6, "Unknown exception", checkRead(reply("01 83 07"), 2));
}

TEST(ReplyTest, FunctionMustMatch) {
    expectFault(-6, kOperationText, checkRead(reply("01 04 02 00 00"), 2));
}

TEST(ReplyTest, ExceptionOfAnotherFunctionIsAWrongOperation) {
    expectFault(-6, kOperationText, checkRead(reply("01 84 02"), 2));
}

TEST(ReplyTest, NodeIsReportedBeforeException) {
    expectFault(-6, kNodeText, checkRead(reply("02 83 02"), 2));
}

TEST(ReplyTest, NodeIsReportedBeforeFunction) {
    expectFault(-6, kNodeText, checkRead(reply("02 04 02"), 2));
}

TEST(ReplyTest, ExceptionIsReportedBeforeDataLength) {
    expectFault(-6, "Exception: Illegal function", checkRead(reply("01 83 01"), 2));
}

TEST(ReplyTest, FunctionIsReportedBeforeDataLength) {
    expectFault(-6, kOperationText, checkRead(reply("01 04 03 12"), 2));
}

TEST(ReplyTest, FunctionIsReportedBeforeOffset) {
    expectFault(-6, kOperationText,
                checkWrite(message("01 06 00 10 12 34"), reply("01 05 00 11 12 34")));
}

TEST(ReplyTest, LengthAndByteCountMustMatch) {
    EXPECT_FALSE(checkRead(reply("01 03 02 12 34"), 2));
    EXPECT_FALSE(checkRead(reply("01 03 02 12 34", 1), 2));
    expectFault(-6, kLengthText, checkRead(reply("01 03 02 12 34 56"), 2));
    expectFault(-6, kLengthText, checkRead(reply("01 03 02 12"), 2));
    expectFault(-6, kLengthText, checkRead(reply("01 03 03 12 34"), 2));
    expectFault(-6, kLengthText, checkRead(reply("01 03 00"), 2));
}

TEST(ReplyTest, CheckOfTheOtherModeMakesTheLengthWrong) {
    _MRTU::Reply frame = reply("01 03 02 12 34", 2);
    frame.checkLength = 1;
    expectFault(-6, kLengthText, checkRead(frame, 2));
}

TEST(ReplyTest, NoDataAtAllIsALengthToo) {
    EXPECT_FALSE(checkRead(reply("01 03 00"), 0));
    expectFault(-6, kLengthText, checkRead(reply("01 03 01"), 0));
}

TEST(ReplyTest, ProductAboveTwoHundredFiftyFiveNeverMatches) {
    _MRTU::Reply frame = reply("01 03 00");
    for (const int dataLength : {256, 512, 1024}) {
        frame.length = dataLength + 3 + 2;
        expectFault(-6, kLengthText, checkRead(frame, dataLength));
    }
}

TEST(ReplyTest, MatchingAcknowledgementsPass) {
    EXPECT_FALSE(checkWrite(message("01 06 00 10 12 34"), reply("01 06 00 10 12 34")));
    EXPECT_FALSE(checkWrite(message("01 05 00 10 FF 00"), reply("01 05 00 10 FF 00")));
    EXPECT_FALSE(
        checkWrite(message("01 10 00 10 00 02 04 00 01 00 02"), reply("01 10 00 10 00 02")));
    EXPECT_FALSE(checkWrite(message("01 0F 00 10 00 03 01 05"), reply("01 0F 00 10 00 03")));
}

TEST(ReplyTest, OffsetMustMatchInBothBytes) {
    for (const char* function : {"05", "06", "0F", "10"}) {
        const std::string head = std::string("01 ") + function;
        const auto request = message(head + " 12 34 FF 00");
        expectFault(-6, kOffsetText, checkWrite(request, reply(head + " 13 34 FF 00")));
        expectFault(-6, kOffsetText, checkWrite(request, reply(head + " 12 35 FF 00")));
    }
}

TEST(ReplyTest, SingleWritesEchoTheirValue) {
    for (const char* function : {"05", "06"}) {
        const std::string head = std::string("01 ") + function + " 00 10 ";
        const auto request = message(head + "FF 00");
        expectFault(-6, kAcknowledgeText, checkWrite(request, reply(head + "FE 00")));
        expectFault(-6, kAcknowledgeText, checkWrite(request, reply(head + "FF 01")));
    }
}

TEST(ReplyTest, BlockWritesTellTheirCount) {
    for (const char* function : {"0F", "10"}) {
        const std::string head = std::string("01 ") + function + " 00 10 ";
        const auto request = message(head + "01 02 04");
        expectFault(-6, kCountText, checkWrite(request, reply(head + "00 02")));
        expectFault(-6, kCountText, checkWrite(request, reply(head + "01 03")));
    }
}

TEST(ReplyTest, OffsetIsReportedBeforeAcknowledge) {
    expectFault(-6, kOffsetText,
                checkWrite(message("01 06 00 10 12 34"), reply("01 06 00 11 12 35")));
}

TEST(ReplyTest, OffsetIsReportedBeforeCount) {
    expectFault(-6, kOffsetText,
                checkWrite(message("01 10 00 10 00 01 02 00 00"), reply("01 10 00 11 00 02")));
}

TEST(ReplyTest, OnlyTwoEchoedBytesAreCompared) {
    EXPECT_FALSE(checkWrite(message("01 06 00 10 11 22 33 44"), reply("01 06 00 10 11 22")));
    EXPECT_FALSE(checkWrite(message("01 06 00 10 11 22 33 44"), reply("01 06 00 10 11 22 00 00")));
}

TEST(ReplyTest, FaultsHaveCodesAndTexts) {
    expectFault(-1, "Can't open serial port", _MRTU::kCannotOpen);
    expectFault(-3, "Protocol not started", _MRTU::kNotStarted);
    expectFault(-4, "No response", _MRTU::kNoResponse);
    expectFault(-6, "The received message too short", _MRTU::kTooShort);
    expectFault(-6, "Incorrect response checksum", _MRTU::kChecksum);
    expectFault(-10, "Node disabled", _MRTU::kNodeDisabled);
    expectFault(-10, "Broadcast request", _MRTU::kBroadcast);
    EXPECT_EQ(0, _MRTU::kNoFault.code);
}

TEST(ReplyTest, EveryExceptionCodeHasItsText) {
    const std::map<int, std::string> texts = {
        {1, "Exception: Illegal function"},
        {2, "Exception: Illegal data address"},
        {3, "Exception: Illegal data value"},
        {4, "Exception: Failure in device"},
        {5, "Exception: server needs more time to finish"},
        {6, "Exception: server device busy"},
        {8, "Exception: parity error in target memory"},
        {10, "Exception: gateway: path to target unavailable"},
        {11, "Exception: gateway: timeout from target"},
    };
    for (int code = 0; code <= 255; ++code) {
        const auto known = texts.find(code);
        EXPECT_EQ(known == texts.end() ? "Unknown exception" : known->second,
                  getExceptionText(static_cast<unsigned char>(code)))
            << code;
    }
}

}  // namespace
