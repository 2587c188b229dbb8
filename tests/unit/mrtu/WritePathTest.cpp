// Writes: requests of functions 5, 6, 15 and 16.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::toHex;
using testing_support::operator+;
using testing_support::rtuMessage;

class WritePathTest : public DriverTest {
  protected:
    /// From now on every request is acknowledged as a slave does it.
    void acknowledgeAll() {
        port.answerWith(
            [](const Bytes& request) { return rtuFrame(testing_support::firstOf(request, 6)); });
    }

    std::string requests() const {
        std::string text;
        for (const Bytes& frame : port.sent())
            text += (text.empty() ? "" : ", ") + toHex(rtuMessage(frame));
        return text;
    }
};

TEST_F(WritePathTest, GoldenSingleRegister) {
    start("presetFunction=06");
    port.reply(hex("11 06 00 01 00 03 9A 9B"));
    EXPECT_NE(0, write(tag("17?HREG?400002?short"), hex("03 00"), 1));
    EXPECT_EQ("11 06 00 01 00 03 9A 9B", sent());
}

TEST_F(WritePathTest, GoldenRegistersInOneRequest) {
    start();
    port.reply(hex("11 10 00 01 00 02 12 98"));
    EXPECT_NE(0, write(tag("17?HREG?400002?short-2"), hex("0A 00 02 01"), 2));
    EXPECT_EQ("11 10 00 01 00 02 04 00 0A 01 02 C6 F0", sent());
}

TEST_F(WritePathTest, SingleCoilsOnAndOff) {
    start("forceFunction=05");
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?OUTP?1?boolean"), hex("01"), 1));
    EXPECT_NE(0, write(tag("1?OUTP?1?boolean"), hex("FE"), 1));
    EXPECT_EQ("01 05 00 00 FF 00, 01 05 00 00 00 00", requests());
}

TEST_F(WritePathTest, CoilNineUsesBitOneOfTheFirstByte) {
    start("forceFunction=05");
    acknowledgeAll();
    const Tag_MRTU* coil = tag("1?OUTP?10?boolean");
    ASSERT_EQ(9, coil->offset());
    EXPECT_NE(0, write(coil, hex("02 00"), 1));
    EXPECT_NE(0, write(coil, hex("FD FF"), 1));
    EXPECT_EQ("01 05 00 09 FF 00, 01 05 00 09 00 00", requests());
}

/// Every coil of a block takes its bit from the first data byte.
TEST_F(WritePathTest, CoilsOneByOneReuseTheFirstByte) {
    start("forceFunction=05");
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?OUTP?7?boolean"), hex("41 FF"), 4));
    EXPECT_EQ("01 05 00 06 FF 00, 01 05 00 07 00 00, 01 05 00 08 FF 00, 01 05 00 09 00 00",
              requests());
}

TEST_F(WritePathTest, CoilsInOneRequest) {
    start();
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?OUTP?20?boolean"), hex("68 06"), 10));
    EXPECT_EQ("01 0F 00 13 00 0A 02 CD 00", requests()) << "from bit 3 of the first byte on";
}

TEST_F(WritePathTest, BitsBehindTheCountAreZero) {
    start();
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?OUTP?1?boolean"), hex("FF FF"), 9));
    EXPECT_EQ("01 0F 00 00 00 09 02 FF 01", requests());
}

TEST_F(WritePathTest, BitHookIsTheBlockHook) {
    start();
    acknowledgeAll();
    const unsigned char data[] = {0x05};
    EXPECT_NE(0, driver->doWriteBits(tag("1?OUTP?1?boolean"), 0, data, 3));
    EXPECT_EQ("01 0F 00 00 00 03 01 05", requests());
}

TEST_F(WritePathTest, BitHookGoesThroughTheOverridableBlockHook) {
    class Derived final : public Protocol_MRTU {
      public:
        int doWrite(const ProtgenTag*, int index, const unsigned char* data, int count) override {
            return index == 7 && *data == 0x05 && count == 3 ? 42 : 0;
        }
    };
    Derived derived;
    const unsigned char data[] = {0x05};
    EXPECT_EQ(42, derived.doWriteBits(nullptr, 7, data, 3));
}

TEST_F(WritePathTest, RegistersOneByOne) {
    start("presetFunction=06");
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?HREG?400011?short-3"), hex("01 00 02 00 03 00"), 3));
    EXPECT_EQ("01 06 00 0A 00 01, 01 06 00 0B 00 02, 01 06 00 0C 00 03", requests());
}

TEST_F(WritePathTest, SecondOfThreeFailingLeavesTheFirstWritten) {
    start("presetFunction=06 repeat=0");
    port.reply(rtuFrame(hex("01 06 00 0A 00 01")));
    port.reply(rtuFrame(hex("01 86 04")));
    EXPECT_EQ(0, write(tag("1?HREG?400011?short-3"), hex("01 00 02 00 03 00"), 3));
    expectError(-6, "Exception: Failure in device");
    EXPECT_EQ("01 06 00 0A 00 01, 01 06 00 0B 00 02", requests());
}

TEST_F(WritePathTest, SecondCoilFailingEndsTheBlock) {
    start("forceFunction=05 repeat=0");
    port.reply(rtuFrame(hex("01 05 00 00 FF 00")));
    port.silence();
    EXPECT_EQ(0, write(tag("1?OUTP?1?boolean-3"), hex("07"), 3));
    expectError(-4, "No response");
    EXPECT_EQ(2U, port.sent().size());
}

TEST_F(WritePathTest, EveryItemIsATransactionOfItsOwn) {
    start("presetFunction=06 delay=5");
    acknowledgeAll();
    const int before = host.multiTask.timesLocked();
    EXPECT_NE(0, write(tag("1?HREG?400001?short-3"), hex("01 00 02 00 03 00"), 3));
    EXPECT_EQ(before + 3, host.multiTask.timesLocked());
    ASSERT_EQ(3U, host.multiTask.sleeps().size());
    for (const auto& sleep : host.multiTask.sleeps()) {
        EXPECT_EQ(5, sleep.ms);
        EXPECT_FALSE(sleep.lockHeld);
    }
}

TEST_F(WritePathTest, LongRegistersGoOneByOneMostSignificantByteFirst) {
    start("model=3 presetFunction=16");
    acknowledgeAll();
    EXPECT_NE(0, write(tag("1?LONG?5?int-2"), hex("44 33 22 11 88 77 66 55"), 2));
    EXPECT_EQ("01 06 00 05 11 22 33 44, 01 06 00 06 55 66 77 88", requests());
}

TEST_F(WritePathTest, LongAcknowledgeMayEchoAllFourBytes) {
    start("model=3");
    port.answerWith([](const Bytes& request) { return request; });
    EXPECT_NE(0, write(tag("1?LONG?5?int"), hex("44 33 22 11"), 1));
}

TEST_F(WritePathTest, ReadOnlyAreasNeverReachTheLine) {
    start("repeat=0");
    EXPECT_EQ(0, write(tag("1?IREG?300001?short"), hex("34 12"), 1));
    EXPECT_EQ(0, write(tag("1?INP?100001?boolean"), hex("01"), 1));
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(WritePathTest, LargestBlocks) {
    start();
    acknowledgeAll();
    Bytes words(246);
    for (std::size_t i = 0; i < words.size(); ++i)
        words[i] = static_cast<std::uint8_t>(i);
    EXPECT_NE(0, write(tag("1?HREG?400001?short"), words, 123));
    ASSERT_EQ(1U, port.sent().size());
    EXPECT_EQ(255U, port.sent()[0].size());
    EXPECT_EQ(0xF6, port.sent()[0][6]);
    EXPECT_NE(0, write(tag("1?OUTP?1?boolean"), Bytes(246, 0xFF), 1968));
    EXPECT_EQ(255U, port.sent()[1].size());
    EXPECT_EQ(0xF6, port.sent()[1][6]);
}

TEST_F(WritePathTest, BlocksThatFitNoFrameAreRefusedBeforeAnythingIsSent) {
    start();
    const Bytes data(4096, 0);
    for (const int count : {124, 127, 128, 200, 1000}) {
        plantError();
        EXPECT_EQ(0, write(tag("1?HREG?400001?short"), data, count)) << count;
        expectError(-1, "Too many items for one request");
    }
    for (const int count : {1977, 2040, 4000}) {
        plantError();
        EXPECT_EQ(0, write(tag("1?OUTP?1?boolean"), data, count)) << count;
        expectError(-1, "Too many items for one request");
    }
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(WritePathTest, BroadcastGoesOut) {
    start("repeat=0");
    port.silence();
    EXPECT_EQ(0, write(tag("0?HREG?400001?short"), hex("34 12"), 1));
    expectError(-4, "No response");
    EXPECT_EQ("00 10 00 00 00 01 02 12 34", requests());
}

TEST_F(WritePathTest, DisabledNodeSendsNothing) {
    start();
    EXPECT_EQ(0, write(tag("255?HREG?400001?short"), hex("34 12"), 1));
    expectError(-10, "Node disabled");
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(WritePathTest, RetriesLikeAReadDoes) {
    start("repeat=2");
    port.silence();
    port.reply(hex("01 10 00 00 00 01 00 00"));
    port.reply(rtuFrame(hex("01 10 00 00 00 01")));
    EXPECT_NE(0, write(tag("1?HREG?400001?short"), hex("34 12"), 1));
    EXPECT_EQ(
        "01 10 00 00 00 01 02 12 34, 01 10 00 00 00 01 02 12 34, "
        "01 10 00 00 00 01 02 12 34",
        requests());
}

}  // namespace
