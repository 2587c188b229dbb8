// Addresses that exist and are refused all the same.
#include <gtest/gtest.h>

#include "sim/Slave.h"

namespace sim {
namespace {

using wire::Bytes;

class RefusedRangeTest : public testing::Test {
  protected:
    Slave slave{
        {NodeOptions{.address = 1,
                     .longs = LongRange{},
                     .refused = {{.area = Area::HoldingRegister, .first = 100, .last = 109},
                                 {.area = Area::HoldingRegister, .first = 5010, .last = 5010},
                                 {.area = Area::Coil, .first = 0, .last = 7}}},
         NodeOptions{.address = 2}}};
};

TEST_F(RefusedRangeTest, EveryRequestThatTouchesTheRangeGetsExceptionTwo) {
    for (const auto& [what, request] : {
             std::pair{"its first", Bytes{1, 3, 0, 100, 0, 1}},
             std::pair{"its last", Bytes{1, 3, 0, 109, 0, 1}},
             std::pair{"across its begin", Bytes{1, 3, 0, 90, 0, 11}},
             std::pair{"across its end", Bytes{1, 3, 0, 109, 0, 5}},
             std::pair{"all of it", Bytes{1, 3, 0, 99, 0, 12}},
             std::pair{"a write of one", Bytes{1, 6, 0, 105, 0, 1}},
             std::pair{"a write across", Bytes{1, 16, 0, 99, 0, 2, 4, 0, 1, 0, 1}},
             std::pair{"a coil", Bytes{1, 5, 0, 7, 0xFF, 0}},
             std::pair{"a 32-bit register", Bytes{1, 3, 0x13, 0x92, 0, 1}},
         }) {
        const Bytes expected{1, static_cast<std::uint8_t>(request[1] | 0x80U), 2};
        EXPECT_EQ(expected, slave.answer(request)) << what;
    }
    EXPECT_EQ(1099U, slave.get(1, Area::HoldingRegister, 99)) << "nothing was written in part";
}

TEST_F(RefusedRangeTest, NeighboursOtherAreasAndOtherNodesAreServed) {
    EXPECT_EQ((Bytes{1, 3, 2, 0x04, 0x4B}), slave.answer(Bytes{1, 3, 0, 99, 0, 1}));
    EXPECT_EQ((Bytes{1, 3, 2, 0x04, 0x56}), slave.answer(Bytes{1, 3, 0, 110, 0, 1}));
    EXPECT_EQ((Bytes{1, 4, 2, 0x79, 0x7C}), slave.answer(Bytes{1, 4, 0, 100, 0, 1}));
    EXPECT_EQ((Bytes{2, 3, 2, 0x08, 0x34}), slave.answer(Bytes{2, 3, 0, 100, 0, 1}));
    EXPECT_EQ((Bytes{1, 5, 0, 8, 0xFF, 0}), slave.answer(Bytes{1, 5, 0, 8, 0xFF, 0}));
}

TEST_F(RefusedRangeTest, TheProgramThatOwnsTheSlaveStillReachesThem) {
    slave.set(1, Area::HoldingRegister, 100, 7);
    EXPECT_EQ(7U, slave.get(1, Area::HoldingRegister, 100));
}

}  // namespace
}  // namespace sim
