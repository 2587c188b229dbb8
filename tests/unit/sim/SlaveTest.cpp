#include "sim/Slave.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <thread>

namespace sim {
namespace {

using wire::Bytes;

TEST(SlaveTest, EachNodeHasItsOwnMemory) {
    Slave slave({{.address = 1}, {.address = 2}});
    ASSERT_TRUE(slave.answer(Bytes{1, 6, 0, 7, 0x12, 0x34}));
    EXPECT_EQ(0x1234U, slave.get(1, Area::HoldingRegister, 7));
    EXPECT_EQ(2007U, slave.get(2, Area::HoldingRegister, 7));
    EXPECT_EQ((Bytes{2, 3, 2, 0x07, 0xD7}), slave.answer(Bytes{2, 3, 0, 7, 0, 1}));
}

TEST(SlaveTest, OtherNodesStayUnanswered) {
    Slave slave({NodeOptions{.address = 1}});
    EXPECT_FALSE(slave.answer(Bytes{2, 3, 0, 0, 0, 1}));
    EXPECT_FALSE(slave.answer(Bytes{1}));
    EXPECT_FALSE(slave.answer({}));
    EXPECT_TRUE(slave.hasNode(1));
    EXPECT_FALSE(slave.hasNode(2));
}

TEST(SlaveTest, BroadcastWritesReachEveryNodeAndStayUnanswered) {
    Slave slave({{.address = 1}, {.address = 2}});
    EXPECT_FALSE(slave.answer(Bytes{0, 5, 0, 0, 0xFF, 0}));
    EXPECT_FALSE(slave.answer(Bytes{0, 6, 0, 1, 0, 9}));
    EXPECT_FALSE(slave.answer(Bytes{0, 15, 0, 8, 0, 2, 1, 3}));
    EXPECT_FALSE(slave.answer(Bytes{0, 16, 0, 2, 0, 1, 2, 0, 8}));
    for (const std::uint8_t node : {std::uint8_t{1}, std::uint8_t{2}}) {
        EXPECT_EQ(1U, slave.get(node, Area::Coil, 0)) << int{node};
        EXPECT_EQ(9U, slave.get(node, Area::HoldingRegister, 1)) << int{node};
        EXPECT_EQ(1U, slave.get(node, Area::Coil, 8)) << int{node};
        EXPECT_EQ(1U, slave.get(node, Area::Coil, 9)) << int{node};
        EXPECT_EQ(8U, slave.get(node, Area::HoldingRegister, 2)) << int{node};
    }
}

TEST(SlaveTest, BroadcastReadsAndUnknownFunctionsStayUnanswered) {
    Slave slave({NodeOptions{.address = 1}});
    EXPECT_FALSE(slave.answer(Bytes{0, 3, 0, 0, 0, 1}));
    EXPECT_FALSE(slave.answer(Bytes{0, 7}));
}

TEST(SlaveTest, BroadcastSkipsTheNodeThatLacksTheAddress) {
    Slave slave({{.address = 1, .sizes = {.holdingRegisters = 1}}, {.address = 2}});
    EXPECT_FALSE(slave.answer(Bytes{0, 6, 0, 5, 0, 9}));
    EXPECT_EQ(1000U, slave.get(1, Area::HoldingRegister, 0));
    EXPECT_EQ(9U, slave.get(2, Area::HoldingRegister, 5));
}

TEST(SlaveTest, RequestLengthIsKnownFromTheHeader) {
    const Slave slave({NodeOptions{.address = 1}});
    for (std::uint8_t function = 1; function <= 6; ++function) {
        EXPECT_EQ(8U, slave.requestLength(Bytes{1, function, 0, 0})) << int{function};
        EXPECT_EQ(8U, slave.requestLength(Bytes{9, function, 0, 0})) << int{function};
        EXPECT_FALSE(slave.requestLength(Bytes{1})) << int{function};
    }
    for (std::uint8_t function = 15; function <= 16; ++function) {
        EXPECT_EQ(11U, slave.requestLength(Bytes{1, function, 0, 0, 0, 1, 2})) << int{function};
        EXPECT_FALSE(slave.requestLength(Bytes{1, function, 0, 0, 0, 1})) << int{function};
    }
    EXPECT_FALSE(slave.requestLength(Bytes{1, 7, 0, 0, 0, 0, 0, 0}));
    EXPECT_FALSE(slave.requestLength({}));
}

TEST(SlaveTest, RefusesImpossibleNodes) {
    EXPECT_THROW(Slave({NodeOptions{.address = 0}}), std::invalid_argument);
    EXPECT_THROW(Slave({{.address = 3}, {.address = 3}}), std::invalid_argument);
}

TEST(SlaveTest, ItemsOutsideTheMemoryAreRefused) {
    Slave slave({NodeOptions{.address = 1, .sizes = {.coils = 4}}});
    EXPECT_THROW(slave.get(1, Area::Coil, 4), std::out_of_range);
    EXPECT_THROW(slave.set(1, Area::Coil, 4, 1), std::out_of_range);
    EXPECT_THROW(slave.get(1, Area::LongRegister, 5000), std::out_of_range);
    EXPECT_THROW(slave.get(2, Area::Coil, 0), std::out_of_range);
}

TEST(SlaveTest, ARequestIsOneStepForOtherThreads) {
    Slave slave({NodeOptions{.address = 1}});
    ASSERT_TRUE(slave.answer(Bytes{1, 16, 0, 0, 0, 2, 4, 0, 0, 0, 0}));
    std::thread writer([&] {
        for (std::uint8_t i = 1; i < 200; ++i) {
            slave.answer(Bytes{1, 16, 0, 0, 0, 2, 4, 0, i, 0, i});
        }
    });
    for (int i = 0; i < 200; ++i) {
        const auto reply = slave.answer(Bytes{1, 3, 0, 0, 0, 2});
        ASSERT_EQ(7U, reply->size());
        EXPECT_EQ((*reply)[6], (*reply)[4]);
    }
    writer.join();
    EXPECT_EQ(199U, slave.get(1, Area::HoldingRegister, 1));
}

}  // namespace
}  // namespace sim
