// Reads: limits, requests, body checks, placing the data.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::asciiFrame;
using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::toHex;
using testing_support::operator+;

struct LimitCase {
    const char* items;
    const char* uri;
    int read;
    int write;
};

class ReadPathTest : public DriverTest {};

TEST_F(ReadPathTest, ItemsPerRequest) {
    const LimitCase cases[] = {
        {"", "1?HREG?400001?short", 125, 123},
        {"maxOptLen=250", "1?HREG?400001?short", 125, 123},
        {"maxOptLen=249", "1?HREG?400001?short", 124, 123},
        {"maxOptLen=100", "1?HREG?400001?short", 50, 50},
        {"maxOptLen=1", "1?HREG?400001?short", 0, 0},
        {"maxOptLen=0", "1?HREG?400001?short", 0, 0},
        {"", "1?IREG?300001?short", 125, 0},
        {"model=3", "1?LONG?0?int", 62, 61},
        {"model=3 maxOptLen=11", "1?LONG?0?int", 2, 2},
        {"", "1?OUTP?1?boolean", 2000, 1968},
        {"maxBitOptLen=100", "1?OUTP?1?boolean", 100, 100},
        {"maxBitOptLen=0", "1?OUTP?1?boolean", 0, 0},
        {"maxOptLen=10", "1?OUTP?1?boolean", 2000, 1968},
        {"maxBitOptLen=10", "1?HREG?400001?short", 125, 123},
        {"", "1?INP?100001?boolean", 2000, 0},
        {"", "1?NO?0?unsignedByte", 1, 1},
        {"", "1?NP_Mode?0?boolean", 1, 1},
        {"", "1?SP_Baud?0?unsignedInt", 0, 0},
        {"maxOptLen=100 Node2::maxOptLen=20", "2?HREG?400001?short", 10, 10},
    };
    for (const LimitCase& limit : cases) {
        SCOPED_TRACE(std::string(limit.items) + " " + limit.uri);
        configure(limit.items);
        EXPECT_EQ(limit.read, driver->getMaxItemCount(tag(limit.uri), false));
        EXPECT_EQ(limit.write, driver->getMaxItemCount(tag(limit.uri), true));
    }
}

TEST_F(ReadPathTest, EveryAreaHasItsFunction) {
    start("model=3");
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"1?OUTP?1?boolean", "01 01 01 00", "01 01 00 00 00 01 FD CA"},
        {"1?INP?100001?boolean", "01 02 01 00", "01 02 00 00 00 01 B9 CA"},
        {"1?HREG?400001?short", "01 03 02 00 00", "01 03 00 00 00 01 84 0A"},
        {"1?IREG?300001?short", "01 04 02 00 00", "01 04 00 00 00 01 31 CA"},
        {"1?LONG?0?int", "01 03 04 00 00 00 00", "01 03 00 00 00 01 84 0A"},
    };
    for (const auto& [uri, answer, request] : cases) {
        port.forget();
        port.reply(rtuFrame(hex(answer)));
        EXPECT_TRUE(read(tag(uri), 1)) << uri;
        EXPECT_EQ(request, sent()) << uri;
    }
}

TEST_F(ReadPathTest, IndexOfTheCallIsTheAddress) {
    start();
    port.reply(rtuFrame(hex("01 03 02 00 00")));
    unsigned char data[2];
    EXPECT_TRUE(driver->doReadBlock(tag("1?HREG?400001?short"), 0x1234, data, 1));
    EXPECT_EQ("01 03 12 34 00 01", toHex(testing_support::rtuMessage(port.sent()[0])));
}

TEST_F(ReadPathTest, TenCoilsAtIndexTwentyOne) {
    start();
    const Tag_MRTU* coils = tag("1?OUTP?22?boolean-10");
    ASSERT_EQ(21, coils->offset());
    const Bytes answer = rtuFrame(hex("01 01 02 FF 03"));
    ASSERT_EQ(7U, answer.size());
    port.reply(answer);
    buffer.assign(4, 0x00);
    ASSERT_TRUE(driver->doReadBlock(coils, 21, buffer.data(), 10));
    EXPECT_EQ("01 01 00 15 00 0A", toHex(testing_support::rtuMessage(port.sent()[0])));
    EXPECT_EQ("E0 7F 00 00", toHex(buffer)) << "bits 5 to 14";
}

TEST_F(ReadPathTest, BitsBesideTheRequestedOnesKeepTheirValues) {
    start();
    port.reply(rtuFrame(hex("01 01 02 00 00")));
    buffer.assign(3, 0xFF);
    ASSERT_TRUE(driver->doReadBlock(tag("1?OUTP?22?boolean"), 21, buffer.data(), 10));
    EXPECT_EQ("1F 80 FF", toHex(buffer));
}

TEST_F(ReadPathTest, BitsLandAtTheIndexWithinTheByteWhateverTheAddress) {
    start();
    for (int index = 0; index < 16; ++index) {
        port.reply(rtuFrame(hex("01 01 01 01")));
        buffer.assign(2, 0x00);
        ASSERT_TRUE(driver->doReadBlock(tag("1?OUTP?1?boolean"), index, buffer.data(), 1));
        EXPECT_EQ(1 << (index % 8), buffer[0]) << index;
        EXPECT_EQ(0, buffer[1]) << index;
    }
}

TEST_F(ReadPathTest, BitHookIsTheBlockHook) {
    start();
    port.reply(rtuFrame(hex("01 02 01 05")));
    buffer.assign(1, 0x00);
    EXPECT_TRUE(driver->doReadBits(tag("1?INP?100001?boolean"), 0, buffer.data(), 3));
    EXPECT_EQ("05", toHex(buffer));
    EXPECT_EQ("01 02 00 00 00 03", toHex(testing_support::rtuMessage(port.sent()[0])));
}

TEST_F(ReadPathTest, RegistersComeInHostOrder) {
    start();
    port.reply(rtuFrame(hex("01 03 06 12 34 56 78 9A BC")));
    ASSERT_TRUE(read(tag("1?HREG?400001?short-3"), 3));
    EXPECT_EQ("34 12 78 56 BC 9A EE", toHex(got(7)));
}

TEST_F(ReadPathTest, LongRegistersAreReversedWhole) {
    start("model=3");
    port.reply(rtuFrame(hex("01 03 08 11 22 33 44 55 66 77 88")));
    ASSERT_TRUE(read(tag("1?LONG?5?int-2"), 2));
    EXPECT_EQ("01 03 00 05 00 02", toHex(testing_support::rtuMessage(port.sent()[0])))
        << "counted in 32-bit registers";
    EXPECT_EQ("44 33 22 11 88 77 66 55 EE", toHex(got(9)));
}

TEST_F(ReadPathTest, ByteCountMustMatchTheRequest) {
    start("repeat=0");
    port.reply(rtuFrame(hex("01 03 04 12 34 56 78")));
    EXPECT_FALSE(read(tag("1?HREG?400001?short-3"), 3));
    expectError(-6, "Incorrect data length received");
    EXPECT_EQ("EE EE EE EE EE EE", toHex(got(6)));
}

TEST_F(ReadPathTest, LengthAndCountErrorsLeaveTheBufferAlone) {
    start("repeat=0 model=3");
    const std::tuple<const char*, int, const char*> cases[] = {
        {"1?HREG?400001?short", 3, "01 03 04 12 34 56 78 9A BC"},
        {"1?HREG?400001?short", 3, "01 03 06 12 34 56 78"},
        {"1?HREG?400001?short", 1, "01 03 02 12 34 56"},
        {"1?HREG?400001?short", 1, "01 03 02"},
        {"1?LONG?0?int", 1, "01 03 02 12 34"},
        {"1?LONG?0?int", 2, "01 03 04 12 34 56 78"},
        {"1?OUTP?1?boolean", 9, "01 01 01 FF"},
        {"1?OUTP?1?boolean", 8, "01 01 02 FF FF"},
        {"1?OUTP?1?boolean", 8, "01 01 02 FF"},
        {"1?OUTP?1?boolean", 8, "01 01 00"},
    };
    for (const auto& [uri, count, answer] : cases) {
        SCOPED_TRACE(answer);
        plantError();
        port.reply(rtuFrame(hex(answer)));
        EXPECT_FALSE(read(tag(uri), count));
        expectError(-6, "Incorrect data length received");
        EXPECT_EQ(toHex(Bytes(16, 0xEE)), toHex(got(16)));
    }
}

TEST_F(ReadPathTest, WrongFunctionIsReportedBeforeDataLength) {
    start("repeat=0");
    port.reply(rtuFrame(hex("01 04 04 12 34 56 78")));
    EXPECT_FALSE(read(tag("1?HREG?400001?short"), 1));
    expectError(-6, "Incorrect operation in response");
}

TEST_F(ReadPathTest, LargestReads) {
    start("model=3");
    port.reply(rtuFrame(hex("01 03 FA") + Bytes(250, 0x5A)));
    EXPECT_TRUE(read(tag("1?HREG?400001?short"), 125));
    port.reply(rtuFrame(hex("01 01 FA") + Bytes(250, 0xA5)));
    EXPECT_TRUE(read(tag("1?OUTP?1?boolean"), 2000));
    EXPECT_EQ(toHex(Bytes(250, 0xA5) + Bytes(6, 0xEE)), toHex(got(256)));
    port.reply(rtuFrame(hex("01 03 F8") + Bytes(248, 0x11)));
    EXPECT_TRUE(read(tag("1?LONG?0?int"), 62));
}

TEST_F(ReadPathTest, ProductAboveOneByteNeverMatches) {
    start("repeat=0");
    port.reply(rtuFrame(hex("01 03 00") + Bytes(256, 1)));
    EXPECT_FALSE(read(tag("1?HREG?400001?short"), 128, 512));
    expectError(-6, "Incorrect data length received");
}

TEST_F(ReadPathTest, FramesBeyondTheBufferAreADataLengthError) {
    start("repeat=0");
    for (const std::size_t data : {252U, 300U, 508U}) {
        SCOPED_TRACE(data);
        plantError();
        port.reply(rtuFrame(hex("01 03 FA") + Bytes(data, 1)));
        EXPECT_FALSE(read(tag("1?HREG?400001?short"), 125, 512));
        expectError(-6, "Incorrect data length received");
    }
}

TEST_F(ReadPathTest, NoItemsAreReadAndNothingIsCopied) {
    start();
    port.reply(rtuFrame(hex("01 03 00")));
    EXPECT_TRUE(read(tag("1?HREG?400001?short"), 0));
    EXPECT_EQ("EE EE", toHex(got(2)));
}

TEST_F(ReadPathTest, BroadcastReadsAreRefused) {
    start();
    EXPECT_FALSE(read(tag("0?HREG?400001?short"), 1));
    expectError(-10, "Broadcast request");
    EXPECT_FALSE(read(tag("256?HREG?400001?short"), 1));
    expectError(-10, "Broadcast request");
    EXPECT_TRUE(port.sent().empty());
    EXPECT_EQ(0, port.looks());
}

TEST_F(ReadPathTest, DisabledNodesAreRefused) {
    start();
    EXPECT_FALSE(read(tag("255?HREG?400001?short"), 1));
    expectError(-10, "Node disabled");
    EXPECT_FALSE(read(tag("511?HREG?400001?short"), 1)) << "the low eight bits count";
    expectError(-10, "Node disabled");
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(ReadPathTest, NodeIsTheLowByte) {
    start("repeat=0");
    port.reply(rtuFrame(hex("2C 03 02 12 34")));
    EXPECT_TRUE(read(tag("300?HREG?400001?short"), 1));
    EXPECT_EQ(0x2C, port.sent()[0][0]);
}

TEST_F(ReadPathTest, AsciiReadsPlaceTheSameData) {
    start("txMode=ASCII");
    port.reply(asciiFrame(hex("01 01 02 FF 03")));
    buffer.assign(2, 0);
    ASSERT_TRUE(driver->doReadBlock(tag("1?OUTP?22?boolean"), 21, buffer.data(), 10));
    EXPECT_EQ("E0 7F", toHex(buffer));
    port.reply(asciiFrame(hex("01 03 04 12 34 56 78")));
    ASSERT_TRUE(read(tag("1?HREG?400001?short"), 2));
    EXPECT_EQ("34 12 78 56", toHex(got(4)));
}

}  // namespace
