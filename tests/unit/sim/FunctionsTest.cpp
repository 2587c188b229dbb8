// Golden bytes: the examples of Modbus Application Protocol V1.1b3, 6.1 to 6.12, on node 0x11.
#include <gtest/gtest.h>

#include <numeric>

#include "sim/Slave.h"

namespace sim {
namespace {

using wire::Bytes;

constexpr std::uint8_t kNode = 0x11;

class FunctionsTest : public testing::Test {
  protected:
    void setBits(Area area, std::uint32_t address, std::initializer_list<int> bits) {
        for (const int bit : bits)
            slave.set(kNode, area, address++, bit != 0 ? 1 : 0);
    }

    void setWords(Area area, std::uint32_t address, std::initializer_list<std::uint32_t> words) {
        for (const std::uint32_t word : words)
            slave.set(kNode, area, address++, word);
    }

    void expectReply(const Bytes& request, const Bytes& reply) {
        const auto answer = slave.answer(request);
        ASSERT_TRUE(answer);
        EXPECT_EQ(reply, *answer);
    }

    std::uint32_t word(std::uint32_t address) const {
        return slave.get(kNode, Area::HoldingRegister, address);
    }

    Slave slave{{NodeOptions{.address = kNode}}};
};

TEST_F(FunctionsTest, ReadCoils20To38) {
    setBits(Area::Coil, 19, {1, 0, 1, 1, 0, 0, 1, 1, 1, 1, 0, 1, 0, 1, 1, 0, 1, 0, 1});
    setBits(Area::Coil, 38, {1, 1, 1, 1, 1});  // Beyond the request: padding stays zero.
    expectReply({0x11, 0x01, 0x00, 0x13, 0x00, 0x13}, {0x11, 0x01, 0x03, 0xCD, 0x6B, 0x05});
}

TEST_F(FunctionsTest, ReadDiscreteInputs197To218) {
    setBits(Area::DiscreteInput, 196,
            {0, 0, 1, 1, 0, 1, 0, 1, 1, 1, 0, 1, 1, 0, 1, 1, 1, 0, 1, 0, 1, 1});
    setBits(Area::DiscreteInput, 218, {1, 1});
    expectReply({0x11, 0x02, 0x00, 0xC4, 0x00, 0x16}, {0x11, 0x02, 0x03, 0xAC, 0xDB, 0x35});
}

TEST_F(FunctionsTest, ReadHoldingRegisters108To110) {
    setWords(Area::HoldingRegister, 107, {0x022B, 0x0000, 0x0064});
    expectReply({0x11, 0x03, 0x00, 0x6B, 0x00, 0x03},
                {0x11, 0x03, 0x06, 0x02, 0x2B, 0x00, 0x00, 0x00, 0x64});
}

TEST_F(FunctionsTest, ReadInputRegister9) {
    setWords(Area::InputRegister, 8, {0x000A});
    expectReply({0x11, 0x04, 0x00, 0x08, 0x00, 0x01}, {0x11, 0x04, 0x02, 0x00, 0x0A});
}

TEST_F(FunctionsTest, WriteSingleCoil173OnAndOff) {
    setBits(Area::Coil, 171, {0, 0, 0});
    const Bytes on{0x11, 0x05, 0x00, 0xAC, 0xFF, 0x00};
    expectReply(on, on);
    EXPECT_EQ(0U, slave.get(kNode, Area::Coil, 171));
    EXPECT_EQ(1U, slave.get(kNode, Area::Coil, 172));
    EXPECT_EQ(0U, slave.get(kNode, Area::Coil, 173));
    const Bytes off{0x11, 0x05, 0x00, 0xAC, 0x00, 0x00};
    expectReply(off, off);
    EXPECT_EQ(0U, slave.get(kNode, Area::Coil, 172));
}

TEST_F(FunctionsTest, WriteSingleRegister2) {
    const Bytes request{0x11, 0x06, 0x00, 0x01, 0x00, 0x03};
    expectReply(request, request);
    EXPECT_EQ(17000U, word(0));
    EXPECT_EQ(3U, word(1));
    EXPECT_EQ(17002U, word(2));
}

TEST_F(FunctionsTest, WriteMultipleCoils20To29) {
    setBits(Area::Coil, 18, {1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1});
    expectReply({0x11, 0x0F, 0x00, 0x13, 0x00, 0x0A, 0x02, 0xCD, 0x01},
                {0x11, 0x0F, 0x00, 0x13, 0x00, 0x0A});
    const Bytes expected{1, 1, 0, 1, 1, 0, 0, 1, 1, 1, 0, 1};  // Coil 18, ten coils, coil 29.
    for (std::uint32_t i = 0; i < expected.size(); ++i) {
        EXPECT_EQ(expected[i], slave.get(kNode, Area::Coil, 18 + i)) << "coil " << 18 + i;
    }
}

TEST_F(FunctionsTest, WriteMultipleRegisters2And3) {
    expectReply({0x11, 0x10, 0x00, 0x01, 0x00, 0x02, 0x04, 0x00, 0x0A, 0x01, 0x02},
                {0x11, 0x10, 0x00, 0x01, 0x00, 0x02});
    EXPECT_EQ(17000U, word(0));
    EXPECT_EQ(0x000AU, word(1));
    EXPECT_EQ(0x0102U, word(2));
    EXPECT_EQ(17003U, word(3));
}

TEST_F(FunctionsTest, LargestReads) {
    const auto bits = slave.answer(Bytes{0x11, 0x01, 0x00, 0x00, 0x07, 0xD0});
    ASSERT_TRUE(bits);
    EXPECT_EQ(3U + 250U, bits->size());
    EXPECT_EQ(250, (*bits)[2]);
    const auto words = slave.answer(Bytes{0x11, 0x03, 0x00, 0x00, 0x00, 0x7D});
    ASSERT_TRUE(words);
    EXPECT_EQ(3U + 250U, words->size());
    EXPECT_EQ(250, (*words)[2]);
    EXPECT_EQ(17124, (*words)[251] << 8 | (*words)[252]);
}

TEST_F(FunctionsTest, LargestWrites) {
    Bytes coils{0x11, 0x0F, 0x00, 0x00, 0x07, 0xB0, 246};
    coils.resize(7 + 246, 0xFF);
    expectReply(coils, {0x11, 0x0F, 0x00, 0x00, 0x07, 0xB0});
    for (std::uint32_t i = 0; i < 1968; ++i)
        EXPECT_EQ(1U, slave.get(kNode, Area::Coil, i)) << i;

    Bytes words{0x11, 0x10, 0x00, 0x00, 0x00, 0x7B, 246};
    words.resize(7 + 246);
    std::iota(words.begin() + 7, words.end(), std::uint8_t{1});
    expectReply(words, {0x11, 0x10, 0x00, 0x00, 0x00, 0x7B});
    EXPECT_EQ(0x0102U, word(0));
    EXPECT_EQ(0xF5F6U, word(122));
    EXPECT_EQ(17123U, word(123));
}

}  // namespace
}  // namespace sim
