// The acknowledgement of a write: one test a rule, one for each pair of neighbours.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;

class WriteAcknowledgeTest : public DriverTest {
  protected:
    /// Writes the register with address 0x0010 (value 0x1234) or, in blocks, two of them.
    void expectRefusal(bool single, const Bytes& answer, const std::string& text) {
        restartDriver();
        start(single ? "repeat=0 presetFunction=06" : "repeat=0");
        port.reply(answer);
        EXPECT_EQ(0, write(tag("1?HREG?400017?short-2"), hex("34 12 78 56"), single ? 1 : 2));
        expectError(-6, text);
        driver->Stop();
    }
    void expectSingle(const std::string& answer, const std::string& text) {
        SCOPED_TRACE(answer);
        expectRefusal(true, rtuFrame(hex(answer)), text);
    }
    void expectBlock(const std::string& answer, const std::string& text) {
        SCOPED_TRACE(answer);
        expectRefusal(false, rtuFrame(hex(answer)), text);
    }
};

TEST_F(WriteAcknowledgeTest, TooShort) {
    expectRefusal(true, hex("01 06 00 10"), "The received message too short");
}

TEST_F(WriteAcknowledgeTest, Checksum) {
    expectRefusal(true, hex("01 06 00 10 12 34 00 00"), "Incorrect response checksum");
}

TEST_F(WriteAcknowledgeTest, Node) {
    expectSingle("02 06 00 10 12 34", "Incorrect node address in response");
}

TEST_F(WriteAcknowledgeTest, Exception) {
    expectSingle("01 86 03", "Exception: Illegal data value");
    expectSingle("01 86 00", "Unknown exception");
    expectBlock("01 90 06", "Exception: server device busy");
}

TEST_F(WriteAcknowledgeTest, Operation) {
    expectSingle("01 10 00 10 12 34", "Incorrect operation in response");
    expectBlock("01 06 00 10 00 02", "Incorrect operation in response");
}

TEST_F(WriteAcknowledgeTest, Offset) {
    expectSingle("01 06 00 11 12 34", "Incorrect offset in response");
    expectSingle("01 06 01 10 12 34", "Incorrect offset in response");
    expectBlock("01 10 00 0F 00 02", "Incorrect offset in response");
}

TEST_F(WriteAcknowledgeTest, EchoedValue) {
    expectSingle("01 06 00 10 13 34", "Incorrect writing data acknowledge");
    expectSingle("01 06 00 10 12 35", "Incorrect writing data acknowledge");
}

TEST_F(WriteAcknowledgeTest, Count) {
    expectBlock("01 10 00 10 00 01", "Incorrect count in response");
    expectBlock("01 10 00 10 01 02", "Incorrect count in response");
}

TEST_F(WriteAcknowledgeTest, ShortIsReportedBeforeChecksum) {
    expectRefusal(true, hex("01 06 00 00"), "The received message too short");
}

TEST_F(WriteAcknowledgeTest, ChecksumIsReportedBeforeNode) {
    expectRefusal(true, hex("02 06 00 10 12 34 00 00"), "Incorrect response checksum");
}

TEST_F(WriteAcknowledgeTest, NodeIsReportedBeforeException) {
    expectSingle("02 86 03", "Incorrect node address in response");
}

TEST_F(WriteAcknowledgeTest, ExceptionIsReportedBeforeOperation) {
    expectSingle("01 86 01", "Exception: Illegal function");
}

TEST_F(WriteAcknowledgeTest, OperationIsReportedBeforeOffset) {
    expectSingle("01 05 00 11 12 34", "Incorrect operation in response");
}

TEST_F(WriteAcknowledgeTest, OffsetIsReportedBeforeEchoedValue) {
    expectSingle("01 06 00 11 12 35", "Incorrect offset in response");
}

TEST_F(WriteAcknowledgeTest, OffsetIsReportedBeforeCount) {
    expectBlock("01 10 00 11 00 03", "Incorrect offset in response");
}

/// A short frame with a good check lacks its last fields: they read as zero.
TEST_F(WriteAcknowledgeTest, MissingFieldsDoNotMatch) {
    expectSingle("01 06 00 10", "Incorrect writing data acknowledge");
    expectBlock("01 10 00 10", "Incorrect count in response");
}

TEST_F(WriteAcknowledgeTest, CoilEcho) {
    start("repeat=0 forceFunction=05");
    port.reply(rtuFrame(hex("01 05 00 00 00 00")));
    EXPECT_EQ(0, write(tag("1?OUTP?1?boolean"), hex("01"), 1));
    expectError(-6, "Incorrect writing data acknowledge");
}

TEST_F(WriteAcknowledgeTest, CoilCount) {
    start("repeat=0");
    port.reply(rtuFrame(hex("01 0F 00 00 00 02")));
    EXPECT_EQ(0, write(tag("1?OUTP?1?boolean"), hex("07"), 3));
    expectError(-6, "Incorrect count in response");
}

}  // namespace
