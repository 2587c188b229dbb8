// An acknowledgement that ends before the value that it should repeat.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::asciiFrame;
using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;

/// A frame of five bytes lacks the sixth, which a check of the acknowledged value looks at.
class ShortAcknowledgeTest : public DriverTest {
  protected:
    /// Writes the register of which the bytes 3 to 5 of `frame` tell the address and the upper half
    /// of the value; an attempt before may leave `earlier` in the buffer.
    int writeAnsweredBy(const Bytes& frame, const std::string& uri, unsigned char lowHalf,
                        const Bytes& earlier = {}) {
        if (!earlier.empty()) port.reply(earlier);
        port.reply(frame);
        return write(tag(uri), {lowHalf, highHalf}, 1);
    }
    static std::string uriOf(int address) {
        return "1?HREG?" + std::to_string(400001 + address) + "?short";
    }
    unsigned char highHalf = 0;
};

TEST_F(ShortAcknowledgeTest, WhatItLacksIsZeroInTheFirstAttempt) {
    start("presetFunction=06 repeat=0");
    const Bytes rtu = rtuFrame(hex("01 06 00"));
    highHalf = rtu[4];
    EXPECT_NE(0, writeAnsweredBy(rtu, uriOf(rtu[3]), 0));
    EXPECT_EQ(0, writeAnsweredBy(rtu, uriOf(rtu[3]), 0x5A));
    expectError(-6, "Incorrect writing data acknowledge");
}

TEST_F(ShortAcknowledgeTest, WhatItLacksIsWhatADamagedFrameBeforeLeft) {
    start("presetFunction=06 repeat=1");
    const Bytes rtu = rtuFrame(hex("01 06 00"));
    highHalf = rtu[4];
    const Bytes damaged = hex("01 06 00 10 12 5A 00 00");
    EXPECT_NE(0, writeAnsweredBy(rtu, uriOf(rtu[3]), 0x5A, damaged));
    EXPECT_EQ(0, writeAnsweredBy(rtu, uriOf(rtu[3]), 0, damaged));
    expectError(-6, "Incorrect writing data acknowledge");
}

TEST_F(ShortAcknowledgeTest, SameInAscii) {
    start("txMode=ASCII presetFunction=06 repeat=1");
    const Bytes frame = asciiFrame(hex("01 06 00 10"));
    highHalf = 0xE9;  // its LRC
    const Bytes damaged = testing_support::characters(":01060010125A00\r\n");
    EXPECT_NE(0, writeAnsweredBy(frame, uriOf(0x10), 0x5A, damaged));
    EXPECT_EQ(0, writeAnsweredBy(frame, uriOf(0x10), 0, damaged));
    expectError(-6, "Incorrect writing data acknowledge");
}

}  // namespace
