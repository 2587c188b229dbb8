// Reads of one tag, and their time stamps.
#include <gtest/gtest.h>

#include <chrono>
#include <numeric>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

unsigned long long systemMilliseconds() {
    using namespace std::chrono;
    const auto sinceEpoch = system_clock::now().time_since_epoch();
    return static_cast<unsigned long long>(duration_cast<milliseconds>(sinceEpoch).count());
}

/// A protocol that reads bits; `device` is their image.
class BitProtocol : public TestProtocol {
  public:
    bool CanReadBitBlock(const ITag*) const override { return true; }
    int ReadBitBlock(const ITag*, unsigned char* data, int bits) override {
        bitCounts.push_back(bits);
        if (readResult != 0) answer(data, static_cast<int>(device.size()));
        return readResult;
    }
    std::vector<int> bitCounts;
};

class BitsWithoutBlock : public TestProtocol {
  public:
    bool CanReadBitBlock(const ITag*) const override { return true; }
};

TEST(ProtocolBaseRead, ValueArrivesAtEveryLength) {
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

TEST(ProtocolBaseRead, BytesThatTheDeviceDoesNotFillAreZero) {
    for (int length : {1, 64, 65, 300}) {
        TestProtocol protocol;
        const TestTag tag("1", bytesShape(length));
        std::vector<unsigned char> value(static_cast<std::size_t>(length), 0xEE);
        ASSERT_EQ(1, protocol.Read(&tag, value.data())) << length;
        EXPECT_EQ(std::vector<unsigned char>(static_cast<std::size_t>(length), 0), value) << length;
    }
}

TEST(ProtocolBaseRead, EmptyAndNegativeLengthsTouchNothing) {
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

TEST(ProtocolBaseRead, FailureLeavesTheValueAndKeepsTheDriversError) {
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

TEST(ProtocolBaseRead, RefusedConversionIsReportedAndLeavesTheValue) {
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

TEST(ProtocolBaseRead, ConversionsRunInTheReadDirection) {
    TestProtocol protocol;
    protocol.device = {0x34, 0x12};
    const TestTag tag("1", {ICU_Type::unsignedShort, ICU_Type::none, 2, 0, 0, {"bcd"}});
    unsigned char value[2] = {};
    ASSERT_EQ(1, protocol.Read(&tag, value));
    EXPECT_EQ(0xD2, value[0]);
    EXPECT_EQ(0x04, value[1]);
}

TEST(ProtocolBaseRead, BitTagsAskForTheirBits) {
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

TEST(ProtocolBaseRead, SingleBitAsksForOneBit) {
    BitProtocol protocol;
    protocol.device = {0x80};
    const TestTag tag("1", {ICU_Type::boolean, ICU_Type::none, 1, 0, 7});
    unsigned char value = 0xEE;
    ASSERT_EQ(1, protocol.Read(&tag, &value));
    EXPECT_EQ(std::vector<int>{1}, protocol.bitCounts);
    EXPECT_EQ(1, value);
}

TEST(ProtocolBaseRead, OtherTagsInBitMemoryAskForEightBitsAByte) {
    BitProtocol protocol;
    protocol.device = {0x34, 0x12};
    const TestTag tag("1", {ICU_Type::short_, ICU_Type::none, 2});
    unsigned char value[2] = {};
    ASSERT_EQ(1, protocol.Read(&tag, value));
    EXPECT_EQ(std::vector<int>{16}, protocol.bitCounts);
    EXPECT_EQ(0x34, value[0]);
    EXPECT_EQ(0x12, value[1]);
}

TEST(ProtocolBaseRead, BitMemoryWithoutBitReadsFailsAndReadsNoBytes) {
    BitsWithoutBlock protocol;
    const TestTag tag("1", {ICU_Type::boolean, ICU_Type::none, 1});
    unsigned char value = 0xEE;
    EXPECT_EQ(0, protocol.Read(&tag, &value));
    EXPECT_EQ(0xEE, value);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_EQ(1, protocol.GetLastError());
}

TEST(CurrentTimeStamp, CountsMillisecondsOfTheSystemClock) {
    const unsigned long long before = systemMilliseconds();
    const unsigned long long stamp = currentTimeStamp();
    EXPECT_LE(before, stamp);
    EXPECT_LE(stamp, systemMilliseconds());
}

class ProtocolBaseTimestamp : public testing::Test {
  protected:
    static constexpr unsigned long long kUnstored = 4711;

    void expectFresh() const {
        EXPECT_LE(before_, stamp_);
        EXPECT_LE(stamp_, systemMilliseconds());
    }

    const unsigned long long before_ = systemMilliseconds();
    unsigned long long stamp_ = kUnstored;
    unsigned char data_[4] = {};
    TestTag tag_{"1", bytesShape(4)};
};

TEST_F(ProtocolBaseTimestamp, SuccessfulReadsAreStamped) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3, 4};
    EXPECT_NE(protocol.readWithTimestamp(&tag_, data_, &stamp_), 0);
    expectFresh();
    EXPECT_EQ(4, data_[3]);
    stamp_ = kUnstored;
    EXPECT_NE(protocol.readBlockWithTimestamp(&tag_, data_, 3, &stamp_), 0);
    expectFresh();
    EXPECT_EQ((std::vector<int>{4, 3}), protocol.readLengths);
}

TEST_F(ProtocolBaseTimestamp, SuccessfulBitReadIsStamped) {
    BitProtocol protocol;
    protocol.device = {0x05};
    EXPECT_NE(protocol.readBitBlockWithTimestamp(&tag_, data_, 3, &stamp_), 0);
    expectFresh();
    EXPECT_EQ(std::vector<int>{3}, protocol.bitCounts);
    EXPECT_EQ(0x05, data_[0]);
}

TEST_F(ProtocolBaseTimestamp, FailedReadsStoreNoStamp) {
    BitProtocol protocol;
    protocol.readResult = 0;
    EXPECT_EQ(0, protocol.readWithTimestamp(&tag_, data_, &stamp_));
    EXPECT_EQ(0, protocol.readBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(0, protocol.readBitBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
}

TEST_F(ProtocolBaseTimestamp, BitReadFailsWhereThereAreNoBitReads) {
    TestProtocol protocol;
    EXPECT_EQ(0, protocol.readBitBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
    EXPECT_EQ(1, protocol.GetLastError());
}

TEST_F(ProtocolBaseTimestamp, RefusedConversionStoresNoStamp) {
    TestProtocol protocol;
    TagShape shape = bytesShape(3);
    shape.conversions = {"swap2"};
    const TestTag odd("1", shape);
    EXPECT_EQ(0, protocol.readWithTimestamp(&odd, data_, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
    EXPECT_EQ(-9, protocol.GetLastError());
}

TEST_F(ProtocolBaseTimestamp, ReadOfADerivedProtocolIsTheOneThatIsStamped) {
    class OwnRead : public TestProtocol {
      public:
        int Read(const ITag*, unsigned char* value) override {
            value[0] = 0x42;
            return 1;
        }
    };
    OwnRead protocol;
    EXPECT_NE(protocol.readWithTimestamp(&tag_, data_, &stamp_), 0);
    expectFresh();
    EXPECT_EQ(0x42, data_[0]);
    EXPECT_TRUE(protocol.readLengths.empty());
}

}  // namespace
