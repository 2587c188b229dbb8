// The time stamps of reads.
#include <gtest/gtest.h>

#include <chrono>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

unsigned long long systemMilliseconds() {
    using namespace std::chrono;
    const auto sinceEpoch = system_clock::now().time_since_epoch();
    return static_cast<unsigned long long>(duration_cast<milliseconds>(sinceEpoch).count());
}

class ProtocolBaseTimestampTest : public testing::Test {
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

TEST_F(ProtocolBaseTimestampTest, CurrentTimeStampCountsMillisecondsOfTheSystemClock) {
    const unsigned long long before = systemMilliseconds();
    const unsigned long long stamp = currentTimeStamp();
    EXPECT_LE(before, stamp);
    EXPECT_LE(stamp, systemMilliseconds());
}

TEST_F(ProtocolBaseTimestampTest, SuccessfulReadsAreStamped) {
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

TEST_F(ProtocolBaseTimestampTest, SuccessfulBitReadIsStamped) {
    BitProtocol protocol;
    protocol.device = {0x05};
    EXPECT_NE(protocol.readBitBlockWithTimestamp(&tag_, data_, 3, &stamp_), 0);
    expectFresh();
    EXPECT_EQ(std::vector<int>{3}, protocol.bitCounts);
    EXPECT_EQ(0x05, data_[0]);
}

TEST_F(ProtocolBaseTimestampTest, FailedReadsStoreNoStamp) {
    BitProtocol protocol;
    protocol.readResult = 0;
    EXPECT_EQ(0, protocol.readWithTimestamp(&tag_, data_, &stamp_));
    EXPECT_EQ(0, protocol.readBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(0, protocol.readBitBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
}

TEST_F(ProtocolBaseTimestampTest, BitReadFailsWhereThereAreNoBitReads) {
    TestProtocol protocol;
    EXPECT_EQ(0, protocol.readBitBlockWithTimestamp(&tag_, data_, 4, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
    EXPECT_EQ(1, protocol.GetLastError());
}

TEST_F(ProtocolBaseTimestampTest, RefusedConversionStoresNoStamp) {
    TestProtocol protocol;
    TagShape shape = bytesShape(3);
    shape.conversions = {"swap2"};
    const TestTag odd("1", shape);
    EXPECT_EQ(0, protocol.readWithTimestamp(&odd, data_, &stamp_));
    EXPECT_EQ(kUnstored, stamp_);
    EXPECT_EQ(-9, protocol.GetLastError());
}

TEST_F(ProtocolBaseTimestampTest, ReadOfADerivedProtocolIsTheOneThatIsStamped) {
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
