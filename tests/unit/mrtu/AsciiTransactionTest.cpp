// What is particular to ASCII transmission.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::asciiFrame;
using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::toHex;
using testing_support::operator+;
using testing_support::characters;

const char* const kUri = "1?HREG?400001?unsignedShort";

class AsciiTransactionTest : public DriverTest {
  protected:
    std::string sentText(std::size_t index) const {
        const Bytes request = port.sent().at(index);
        return {request.begin(), request.end()};
    }
};

TEST_F(AsciiTransactionTest, GoldenReadRequest) {
    start("txMode=ASCII");
    port.reply(asciiFrame(hex("01 03 14") + Bytes(20, 7)));
    ASSERT_TRUE(read(tag(kUri), 10));
    EXPECT_EQ(":01030000000AF2\r\n", sentText(0));
    EXPECT_EQ(17U, sentText(0).size());
}

TEST_F(AsciiTransactionTest, GoldenWriteRequest) {
    start("txMode=ASCII");
    port.reply(asciiFrame(hex("01 10 00 00 00 01")));
    EXPECT_NE(0, write(tag(kUri), hex("34 12"), 1));
    EXPECT_EQ(":011000000001021234A6\r\n", sentText(0));
}

TEST_F(AsciiTransactionTest, ReplyIsDecoded) {
    start("txMode=ASCII");
    port.reply(characters(":010302ABCD82\r\n"));
    ASSERT_TRUE(read(tag(kUri), 1)) << driver->GetLastErrorString();
    EXPECT_EQ("CD AB", toHex(got(2)));
}

TEST_F(AsciiTransactionTest, LowerCaseReplyIsRetried) {
    start("txMode=ASCII repeat=1");
    port.reply(characters(":010302abcd82\r\n"));
    port.reply(characters(":010302ABCD82\r\n"));
    ASSERT_TRUE(read(tag(kUri), 1));
    EXPECT_EQ(2U, port.sent().size());
}

TEST_F(AsciiTransactionTest, BadFramesAreRetried) {
    for (const char* bad : {":010302ABCD83\r\n", "010302ABCD82\r\n", "0:10302ABCD82\r\n",
                            ":0100F\r\n", ":010302ABGD82\r\n", ":010302AB D82\r\n"}) {
        SCOPED_TRACE(bad);
        start("txMode=ASCII repeat=1");
        port.forget();
        port.reply(characters(bad));
        port.reply(characters(":010302ABCD82\r\n"));
        EXPECT_TRUE(read(tag(kUri), 1));
        EXPECT_EQ(2U, port.sent().size());
        driver->Stop();
    }
}

TEST_F(AsciiTransactionTest, ExceptionReply) {
    start("txMode=ASCII repeat=0");
    port.reply(asciiFrame(hex("01 83 02")));
    EXPECT_FALSE(read(tag(kUri), 1));
    expectError(-6, "Exception: Illegal data address");
}

TEST_F(AsciiTransactionTest, ReadChecksUseDecodedLength) {
    start("txMode=ASCII repeat=0");
    port.reply(asciiFrame(hex("01 03 02 12 34 56")));
    EXPECT_FALSE(read(tag(kUri), 1));
    expectError(-6, "Incorrect data length received");
}

TEST_F(AsciiTransactionTest, WriteChecks) {
    start("txMode=ASCII repeat=0");
    port.reply(asciiFrame(hex("01 10 00 01 00 01")));
    EXPECT_EQ(0, write(tag(kUri), hex("34 12"), 1));
    expectError(-6, "Incorrect offset in response");
}

TEST_F(AsciiTransactionTest, LongestReadFitsTheReception) {
    start("txMode=ASCII repeat=0");
    const Bytes answer = asciiFrame(hex("01 03 FA") + Bytes(250, 0x5A));
    ASSERT_EQ(511U, answer.size());
    port.reply(answer);
    EXPECT_TRUE(read(tag(kUri), 125, 256)) << driver->GetLastErrorString();
    EXPECT_EQ(toHex(Bytes(250, 0x5A)), toHex(got(250)));
}

TEST_F(AsciiTransactionTest, TextsOtherThanAsciiAreRtu) {
    for (const char* mode : {"txMode=ascii", "txMode=Ascii", "txMode=rtu", "txMode=x"}) {
        SCOPED_TRACE(mode);
        start(mode);
        port.forget();
        port.reply(driver_test::rtuFrame(hex("01 03 02 12 34")));
        EXPECT_TRUE(read(tag(kUri), 1));
        EXPECT_EQ("01 03 00 00 00 01 84 0A", sent());
        driver->Stop();
    }
}

}  // namespace
