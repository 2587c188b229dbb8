// What is reported when every attempt failed: only the last one counts.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::asciiFrame;
using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::toHex;
using testing_support::characters;
using testing_support::firstOf;

const char* const kUri = "1?HREG?400001?unsignedShort";
const Bytes kGood = rtuFrame(hex("01 03 02 12 34"));
const Bytes kBad = hex("01 03 02 12 34 00 00");

class LastAttemptTest : public DriverTest {
  protected:
    bool readOne() { return read(tag(kUri), 1); }
};

TEST_F(LastAttemptTest, EveryTruncationOfAGoodReply) {
    start("repeat=0");
    for (std::size_t length = 0; length < kGood.size(); ++length) {
        SCOPED_TRACE(length);
        plantError();
        const Bytes cut = firstOf(kGood, length);
        port.reply(cut);
        EXPECT_FALSE(readOne());
        if (length == 0) {
            expectError(-4, "No response");
        } else if (length < 5) {
            expectError(-6, "The received message too short");
        } else {
            expectError(-6, "Incorrect response checksum");
        }
        EXPECT_EQ("EE EE", toHex(got(2))) << "the buffer was touched";
    }
}

TEST_F(LastAttemptTest, EveryTruncationOfAWriteAcknowledge) {
    start("repeat=0");
    const Bytes good = rtuFrame(hex("01 10 00 00 00 01"));
    for (std::size_t length = 0; length < good.size(); ++length) {
        SCOPED_TRACE(length);
        plantError();
        port.reply(firstOf(good, length));
        EXPECT_EQ(0, write(tag(kUri), hex("34 12"), 1));
        if (length == 0) {
            expectError(-4, "No response");
        } else if (length < 5) {
            expectError(-6, "The received message too short");
        } else {
            expectError(-6, "Incorrect response checksum");
        }
    }
}

TEST_F(LastAttemptTest, SilenceAtTheEndHidesAnEarlierBadFrame) {
    start("repeat=1");
    port.reply(kBad);
    port.silence();
    EXPECT_FALSE(readOne());
    expectError(-4, "No response");
}

TEST_F(LastAttemptTest, ShortFrameAtTheEndHidesEarlierSilence) {
    start("repeat=1");
    port.silence();
    port.reply(hex("01 03 02"));
    EXPECT_FALSE(readOne());
    expectError(-6, "The received message too short");
}

TEST_F(LastAttemptTest, BadCheckAtTheEndHidesAnEarlierShortFrame) {
    start("repeat=1");
    port.reply(hex("01 03 02"));
    port.reply(kBad);
    EXPECT_FALSE(readOne());
    expectError(-6, "Incorrect response checksum");
}

TEST_F(LastAttemptTest, ChecksumIsReportedBeforeNode) {
    start("repeat=0");
    port.reply(hex("02 03 02 12 34 00 00"));
    EXPECT_FALSE(readOne());
    expectError(-6, "Incorrect response checksum");
}

TEST_F(LastAttemptTest, TooShortIsReportedBeforeChecksum) {
    start("repeat=0");
    port.reply(hex("01 03 02 00"));
    EXPECT_FALSE(readOne());
    expectError(-6, "The received message too short");
}

TEST_F(LastAttemptTest, SingleByteIsTooShort) {
    start("repeat=0");
    port.reply(hex("01"));
    EXPECT_FALSE(readOne());
    expectError(-6, "The received message too short");
}

TEST_F(LastAttemptTest, FourByteFrameIsNeverAcceptedEvenWithAGoodCrc) {
    start("repeat=0");
    const Bytes four = rtuFrame(hex("01 83"));
    ASSERT_EQ(4U, four.size());
    port.reply(four);
    EXPECT_FALSE(readOne());
    expectError(-6, "The received message too short");
}

/// The rest of the frame arrived, but the port says that reading it failed: nothing of it counts.
TEST_F(LastAttemptTest, FailedReceptionIsNoFrame) {
    start("repeat=0");
    port.failFrame(kGood);
    EXPECT_FALSE(readOne());
    expectError(-6, "Incorrect response checksum");
    port.failFrame(firstOf(kGood, 3));
    EXPECT_FALSE(readOne());
    expectError(-6, "The received message too short");
}

TEST_F(LastAttemptTest, FailedReceptionIsRetried) {
    start("repeat=1");
    port.failFrame(kGood);
    port.reply(kGood);
    EXPECT_TRUE(readOne());
    EXPECT_EQ(2U, port.sent().size());
}

TEST_F(LastAttemptTest, AsciiCountsCharacters) {
    start("txMode=ASCII repeat=0");
    for (const char* text : {":", ":01", ":010"}) {
        SCOPED_TRACE(text);
        plantError();
        port.reply(characters(text));
        EXPECT_FALSE(readOne());
        expectError(-6, "The received message too short");
    }
    for (const char* text : {":0103", ":010302123", ":0103021234FF\r\n", "0103021234B4\r\n"}) {
        SCOPED_TRACE(text);
        plantError();
        port.reply(characters(text));
        EXPECT_FALSE(readOne());
        expectError(-6, "Incorrect response checksum");
    }
}

/// The last look at the frame is a CRC check in both modes: decoded bytes that happen to end in
/// their CRC are taken after all, with the check length of an LRC.
TEST_F(LastAttemptTest, AsciiFrameWithACrcInsteadOfItsLrcIsTakenAtTheEnd) {
    start("txMode=ASCII repeat=0");
    // One byte more than the data, because the mode's check has one byte and a CRC two: the count
    // says 3, and the CRC's low byte passes for data.
    const Bytes bytes = rtuFrame(hex("01 03 02 12"));
    ASSERT_EQ(6U, bytes.size());
    std::string digits = toHex(bytes);
    std::erase(digits, ' ');
    port.reply(characters(":" + digits + "\r\n"));
    ASSERT_TRUE(readOne()) << driver->GetLastErrorString();
    EXPECT_EQ(toHex({bytes[4], 0x12}), toHex(got(2)));
}

}  // namespace
