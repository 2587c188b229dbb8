#include "sim/Memory.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace sim {
namespace {

struct ContentsCase {
    Area area;
    std::uint8_t node;
    std::uint16_t address;
    std::uint32_t value;
};

TEST(MemoryTest, ContentsFollowTheFormula) {
    for (const ContentsCase& each : {
             ContentsCase{Area::Coil, 1, 0, 0},
             ContentsCase{Area::Coil, 1, 2, 1},
             ContentsCase{Area::Coil, 3, 0, 1},
             ContentsCase{Area::DiscreteInput, 1, 0, 1},
             ContentsCase{Area::DiscreteInput, 1, 1, 0},
             ContentsCase{Area::DiscreteInput, 1, 4, 1},
             ContentsCase{Area::HoldingRegister, 1, 5, 1005},
             ContentsCase{Area::HoldingRegister, 66, 0, 464},
             ContentsCase{Area::InputRegister, 1, 5, 31005},
             ContentsCase{Area::InputRegister, 247, 9999, 24855},
             ContentsCase{Area::LongRegister, 1, 5, 100503015},
             ContentsCase{Area::LongRegister, 247, 65535, 1189666533},
         }) {
        EXPECT_EQ(each.value, initialValue(each.area, each.node, each.address))
            << "area " << static_cast<int>(each.area) << " node " << int{each.node} << " address "
            << each.address;
    }
}

TEST(MemoryTest, EndsAtItsSizes) {
    const Memory memory(1, {.coils = 8, .discreteInputs = 0, .holdingRegisters = 65536}, {});
    EXPECT_TRUE(memory.has(Area::Coil, 0, 8));
    EXPECT_TRUE(memory.has(Area::Coil, 7, 1));
    EXPECT_FALSE(memory.has(Area::Coil, 7, 2));
    EXPECT_FALSE(memory.has(Area::Coil, 8, 1));
    EXPECT_FALSE(memory.has(Area::DiscreteInput, 0, 1));
    EXPECT_TRUE(memory.has(Area::HoldingRegister, 65535, 1));
    EXPECT_FALSE(memory.has(Area::HoldingRegister, 65535, 2));
    EXPECT_FALSE(memory.has(Area::LongRegister, 0, 1));
}

TEST(MemoryTest, LongRegistersCountFromTheirBase) {
    const Memory memory(1, {}, LongRange{.base = 5000, .count = 10});
    EXPECT_FALSE(memory.has(Area::LongRegister, 4999, 1));
    EXPECT_TRUE(memory.has(Area::LongRegister, 5000, 10));
    EXPECT_FALSE(memory.has(Area::LongRegister, 5000, 11));
    EXPECT_EQ(600018000U, memory.get(Area::LongRegister, 5000));
}

TEST(MemoryTest, KeepsOnlyTheBitsOfTheArea) {
    Memory memory(1, {}, LongRange{});
    memory.set(Area::Coil, 0, 0xFFFFFFFF);
    memory.set(Area::HoldingRegister, 0, 0x12345678);
    memory.set(Area::LongRegister, 5000, 0x12345678);
    EXPECT_EQ(1U, memory.get(Area::Coil, 0));
    EXPECT_EQ(0x5678U, memory.get(Area::HoldingRegister, 0));
    EXPECT_EQ(0x12345678U, memory.get(Area::LongRegister, 5000));
}

TEST(MemoryTest, RefusesWhatNoAddressReaches) {
    EXPECT_THROW(Memory(1, {.coils = 65537}, {}), std::invalid_argument);
    EXPECT_THROW(Memory(1, {}, LongRange{.base = 65535, .count = 2}), std::invalid_argument);
    EXPECT_THROW(Memory(1, {}, LongRange{.base = 1, .count = 0xFFFFFFFF}), std::invalid_argument);
    EXPECT_NO_THROW(Memory(1, {}, LongRange{.base = 65535, .count = 1}));
}

}  // namespace
}  // namespace sim
