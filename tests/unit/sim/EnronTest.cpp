// 32-bit registers behind functions 3 and 6.
#include <gtest/gtest.h>

#include "sim/Slave.h"

namespace sim {
namespace {

using wire::Bytes;

class EnronTest : public testing::Test {
  protected:
    Slave slave{{NodeOptions{.address = 1, .longs = LongRange{.base = 5000, .count = 100}},
                 NodeOptions{.address = 2}}};
};

TEST_F(EnronTest, ReadCountsInLongRegistersMostSignificantByteFirst) {
    slave.set(1, Area::LongRegister, 5001, 0x11223344);
    slave.set(1, Area::LongRegister, 5002, 0x55667788);
    EXPECT_EQ((Bytes{1, 3, 8, 0x11, 0x22, 0x33, 0x44, 0x55, 0x66, 0x77, 0x88}),
              slave.answer(Bytes{1, 3, 0x13, 0x89, 0, 2}));
}

TEST_F(EnronTest, WriteCarriesFourBytesAndIsEchoedWhole) {
    const Bytes request{1, 6, 0x13, 0x88, 0xDE, 0xAD, 0xBE, 0xEF};
    EXPECT_EQ(request, slave.answer(request));
    EXPECT_EQ(0xDEADBEEFU, slave.get(1, Area::LongRegister, 5000));
    EXPECT_EQ(6000U, slave.get(1, Area::HoldingRegister, 5000));
}

TEST_F(EnronTest, SixtyTwoIsTheLargestRead) {
    const auto reply = slave.answer(Bytes{1, 3, 0x13, 0x88, 0, 62});
    ASSERT_TRUE(reply);
    EXPECT_EQ(3U + 248U, reply->size());
    EXPECT_EQ(248, (*reply)[2]);
    EXPECT_EQ((Bytes{1, 0x83, 3}), slave.answer(Bytes{1, 3, 0x13, 0x88, 0, 63}));
}

TEST_F(EnronTest, ReadsDoNotCrossTheRangesBounds) {
    EXPECT_EQ((Bytes{1, 0x83, 2}), slave.answer(Bytes{1, 3, 0x13, 0x87, 0, 2}));  // 4999 and 5000
    EXPECT_EQ((Bytes{1, 0x83, 2}), slave.answer(Bytes{1, 3, 0x13, 0xEB, 0, 2}));  // 5099 and 5100
    EXPECT_EQ((Bytes{1, 3, 2, 0x17, 0x6F}), slave.answer(Bytes{1, 3, 0x13, 0x87, 0, 1}));
    EXPECT_EQ((Bytes{1, 3, 2, 0x17, 0xD4}), slave.answer(Bytes{1, 3, 0x13, 0xEC, 0, 1}));
}

TEST_F(EnronTest, ShortWriteIntoTheRangeIsRefused) {
    EXPECT_EQ((Bytes{1, 0x86, 3}), slave.answer(Bytes{1, 6, 0x13, 0x88, 0, 1}));
    EXPECT_EQ(600018000U, slave.get(1, Area::LongRegister, 5000));
}

TEST_F(EnronTest, Function16DoesNotReachTheRange) {
    EXPECT_EQ((Bytes{1, 0x90, 2}), slave.answer(Bytes{1, 16, 0x13, 0x87, 0, 2, 4, 0, 1, 0, 2}));
    EXPECT_EQ(5999U, slave.get(1, Area::HoldingRegister, 4999));
}

TEST_F(EnronTest, OtherFunctionsAndNodesKnowNoLongRegisters) {
    EXPECT_EQ((Bytes{1, 4, 2, 0x8C, 0xA0}), slave.answer(Bytes{1, 4, 0x13, 0x88, 0, 1}));
    EXPECT_EQ((Bytes{2, 3, 2, 0x1B, 0x58}), slave.answer(Bytes{2, 3, 0x13, 0x88, 0, 1}));
}

TEST_F(EnronTest, RequestLengthFollowsNodeAndAddress) {
    EXPECT_EQ(10U, slave.requestLength(Bytes{1, 6, 0x13, 0x88}));
    EXPECT_EQ(8U, slave.requestLength(Bytes{1, 6, 0x13, 0x87}));
    EXPECT_EQ(8U, slave.requestLength(Bytes{2, 6, 0x13, 0x88}));
    EXPECT_EQ(10U, slave.requestLength(Bytes{0, 6, 0x13, 0x88}));
    EXPECT_EQ(8U, slave.requestLength(Bytes{0, 6, 0x00, 0x00}));
    EXPECT_EQ(8U, slave.requestLength(Bytes{1, 3, 0x13, 0x88}));
    EXPECT_FALSE(slave.requestLength(Bytes{1, 6, 0x13}));
}

TEST_F(EnronTest, LongBroadcastReachesTheLongNodeOnly) {
    EXPECT_FALSE(slave.answer(Bytes{0, 6, 0x13, 0x88, 0, 1, 0, 2}));
    EXPECT_EQ(0x00010002U, slave.get(1, Area::LongRegister, 5000));
    EXPECT_EQ(7000U, slave.get(2, Area::HoldingRegister, 5000));
}

}  // namespace
}  // namespace sim
