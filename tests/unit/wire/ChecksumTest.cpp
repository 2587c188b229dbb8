// Golden values: Modbus over Serial Line V1.02 and the catalogued check value of CRC-16/MODBUS.
#include "wire/Checksum.h"

#include <gtest/gtest.h>

#include <string_view>

namespace wire {
namespace {

Bytes bytesOf(std::string_view text) {
    return {text.begin(), text.end()};
}

TEST(ChecksumTest, CrcCheckValueIsTheCataloguedOne) {
    EXPECT_EQ(0x4B37, crc16(bytesOf("123456789")));
}

TEST(ChecksumTest, CrcStandardsExampleOfFunctionSevenAtNodeTwo) {
    EXPECT_EQ(0x1241, crc16(Bytes{0x02, 0x07}));
}

TEST(ChecksumTest, CrcNothingGivesTheStartValue) {
    EXPECT_EQ(0xFFFF, crc16({}));
}

TEST(ChecksumTest, CrcEverySingleBitErrorChangesIt) {
    const Bytes good{0x01, 0x03, 0x00, 0x00, 0x00, 0x0A};
    for (std::size_t bit = 0; bit < good.size() * 8; ++bit) {
        Bytes bad = good;
        bad[bit / 8] = static_cast<std::uint8_t>(bad[bit / 8] ^ (1U << (bit % 8)));
        EXPECT_NE(crc16(bad), crc16(good)) << "bit " << bit;
    }
}

TEST(ChecksumTest, LrcKnownRequest) {
    EXPECT_EQ(0x7E, lrc8(Bytes{0x11, 0x03, 0x00, 0x6B, 0x00, 0x03}));
}

TEST(ChecksumTest, LrcSumWithTheBytesIsZero) {
    const Bytes bytes{0xFF, 0xFF, 0x80, 0x7F, 0x01};
    std::uint32_t sum = lrc8(bytes);
    for (const std::uint8_t byte : bytes)
        sum += byte;
    EXPECT_EQ(0U, sum % 256);
}

TEST(ChecksumTest, LrcNothingGivesZero) {
    EXPECT_EQ(0, lrc8({}));
}

}  // namespace
}  // namespace wire
