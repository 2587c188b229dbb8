// Reads of one tag.
#include <gtest/gtest.h>

#include <numeric>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

class BitsWithoutBlock : public TestProtocol {
  public:
    bool CanReadBitBlock(const ITag*) const override { return true; }
};

TEST(ProtocolBaseReadTest, ValueArrivesAtEveryLength) {
    for (int length : {1, 2, 63, 64, 65, 255, 256, 257, 5000}) {
        TestProtocol protocol;
        protocol.device.resize(static_cast<std::size_t>(length));
        std::iota(protocol.device.begin(), protocol.device.end(), static_cast<unsigned char>(1));
        const TestTag tag("1", bytesShape(length));
        std::vector<unsigned char> value(static_cast<std::size_t>(length), 0xEE);
        EXPECT_EQ(1, protocol.Read(&tag, value.data())) << length;
        EXPECT_EQ(std::vector<int>{length}, protocol.readLengths);
        EXPECT_EQ(protocol.device, value) << length;
    }
}

TEST(ProtocolBaseReadTest, BytesThatTheDeviceDoesNotFillAreZero) {
    for (int length : {1, 64, 65, 300}) {
        TestProtocol protocol;
        const TestTag tag("1", bytesShape(length));
        std::vector<unsigned char> value(static_cast<std::size_t>(length), 0xEE);
        ASSERT_EQ(1, protocol.Read(&tag, value.data())) << length;
        EXPECT_EQ(std::vector<unsigned char>(static_cast<std::size_t>(length), 0), value) << length;
    }
}

TEST(ProtocolBaseReadTest, EmptyAndNegativeLengthsTouchNothing) {
    for (int length : {0, -1, -65, -2147483647 - 1}) {
        TestProtocol protocol;
        protocol.device = {1, 2, 3};
        const TestTag tag("1", bytesShape(length));
        unsigned char value = 0xEE;
        EXPECT_EQ(1, protocol.Read(&tag, &value)) << length;
        EXPECT_EQ(std::vector<int>{length}, protocol.readLengths);
        EXPECT_EQ(0xEE, value) << length;
    }
}

TEST(ProtocolBaseReadTest, FailureLeavesTheValueAndKeepsTheDriversError) {
    TestProtocol protocol;
    protocol.device = {1};
    protocol.readResult = 0;
    const TestTag tag("1", bytesShape(1));
    unsigned char value = 0xEE;
    EXPECT_EQ(0, protocol.Read(&tag, &value));
    EXPECT_EQ(0xEE, value);
    EXPECT_EQ(-4, protocol.GetLastError());
    EXPECT_STREQ("nobody answered the read", protocol.GetLastErrorString());
}

TEST(ProtocolBaseReadTest, RefusedConversionIsReportedAndLeavesTheValue) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3};
    TagShape shape = bytesShape(3);
    shape.conversions = {"swap2"};
    const TestTag tag("1", shape);
    unsigned char value[3] = {0xEE, 0xEE, 0xEE};
    EXPECT_EQ(0, protocol.Read(&tag, value));
    EXPECT_EQ(-9, protocol.GetLastError());
    EXPECT_STREQ("read conversion error", protocol.GetLastErrorString());
    for (unsigned char byte : value)
        EXPECT_EQ(0xEE, byte);
}

TEST(ProtocolBaseReadTest, ConversionsRunInTheReadDirection) {
    TestProtocol protocol;
    protocol.device = {0x34, 0x12};
    const TestTag tag("1", {ICU_Type::unsignedShort, ICU_Type::none, 2, 0, 0, {"bcd"}});
    unsigned char value[2] = {};
    ASSERT_EQ(1, protocol.Read(&tag, value));
    EXPECT_EQ(0xD2, value[0]);
    EXPECT_EQ(0x04, value[1]);
}

TEST(ProtocolBaseReadTest, BitTagsAskForTheirBits) {
    BitProtocol protocol;
    protocol.device = {0b10101000, 0b00000011};
    const TestTag tag("1", {ICU_Type::booleanArray, ICU_Type::boolean, 7, 0, 3});
    unsigned char value[7] = {};
    ASSERT_EQ(1, protocol.Read(&tag, value));
    EXPECT_EQ(std::vector<int>{7}, protocol.bitCounts);
    EXPECT_TRUE(protocol.readLengths.empty());
    const std::vector<unsigned char> expected{1, 0, 1, 0, 1, 1, 1};
    EXPECT_EQ(expected, std::vector<unsigned char>(value, value + 7));
}

TEST(ProtocolBaseReadTest, SingleBitAsksForOneBit) {
    BitProtocol protocol;
    protocol.device = {0x80};
    const TestTag tag("1", {ICU_Type::boolean, ICU_Type::none, 1, 0, 7});
    unsigned char value = 0xEE;
    ASSERT_EQ(1, protocol.Read(&tag, &value));
    EXPECT_EQ(std::vector<int>{1}, protocol.bitCounts);
    EXPECT_EQ(1, value);
}

TEST(ProtocolBaseReadTest, OtherTagsInBitMemoryAskForEightBitsAByte) {
    BitProtocol protocol;
    protocol.device = {0x34, 0x12};
    const TestTag tag("1", {ICU_Type::short_, ICU_Type::none, 2});
    unsigned char value[2] = {};
    ASSERT_EQ(1, protocol.Read(&tag, value));
    EXPECT_EQ(std::vector<int>{16}, protocol.bitCounts);
    EXPECT_EQ(0x34, value[0]);
    EXPECT_EQ(0x12, value[1]);
}

TEST(ProtocolBaseReadTest, BitMemoryWithoutBitReadsFailsAndReadsNoBytes) {
    BitsWithoutBlock protocol;
    const TestTag tag("1", {ICU_Type::boolean, ICU_Type::none, 1});
    unsigned char value = 0xEE;
    EXPECT_EQ(0, protocol.Read(&tag, &value));
    EXPECT_EQ(0xEE, value);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_EQ(1, protocol.GetLastError());
}

}  // namespace
