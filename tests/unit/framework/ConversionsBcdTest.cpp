#include <gtest/gtest.h>

#include <cstdint>
#include <utility>

#include "tests/unit/framework/ConversionsFixture.h"

namespace {

using namespace conversions_test;

struct BcdRow {
    int size;
    std::uint64_t digits;  // as the device holds them
    std::uint64_t value;
};
constexpr BcdRow kBcd[] = {
    {1, 0x00, 0},
    {1, 0x09, 9},
    {1, 0x42, 42},
    {1, 0x99, 99},
    {2, 0x1234, 1234},
    {2, 0x0007, 7},
    {2, 0x9999, 9999},
    {3, 0x123456, 123456},
    {3, 0x999999, 999999},
    {4, 0x12345678, 12345678},
    {4, 0x99999999, 99999999},
    {4, 0, 0},
};

// The shape alone counts for BCD, not the type.
ConversionShape Items(int size, int items = 1) {
    return {size * items, size, items, ICU_Type::float_};
}

TEST(ConversionsBcdTest, TurnsDigitsIntoNumbersAndBack) {
    for (const BcdRow& row : kBcd) {
        const Bytes digits = LittleEndian(row.digits, row.size);
        const Bytes value = LittleEndian(row.value, row.size);
        EXPECT_EQ(value, Converted(digits, "bcd", Items(row.size), kRead)) << row.digits;
        EXPECT_EQ(digits, Converted(value, "bcd", Items(row.size), kWrite)) << row.value;
    }
}

TEST(ConversionsBcdTest, ReadsLowByteFirst) {
    EXPECT_EQ((Bytes{0xD2, 0x04}), Converted({0x34, 0x12}, "bcd", Shape(ICU_Type::short_), kRead));
}

TEST(ConversionsBcdTest, ReadsEightBytesAndTheTenOfATime) {
    EXPECT_EQ(LittleEndian(9876543210123456U, 8),
              Converted(LittleEndian(0x9876543210123456U, 8), "bcd", Items(8), kRead));
    // 99999999999999999999 = 0x56BC75E2D630FFFFF has 67 bits
    EXPECT_EQ((Bytes{0xFF, 0xFF, 0x0F, 0x63, 0x2D, 0x5E, 0xC7, 0x6B, 0x05, 0x00}),
              Converted(Bytes(10, 0x99), "bcd", Shape(ICU_Type::time), kRead));
}

TEST(ConversionsBcdTest, RefusesEveryNibbleAboveNine) {
    for (int byte = 0; byte < 256; ++byte) {
        const bool digits = byte % 16 <= 9 && byte / 16 <= 9;
        for (std::size_t place = 0; place < 4; ++place) {
            Bytes bytes(4, 0x11);
            bytes[place] = static_cast<unsigned char>(byte);
            EXPECT_EQ(digits, !Converted(bytes, "bcd", Items(4), kRead).empty()) << byte;
        }
    }
}

TEST(ConversionsBcdTest, RefusesValuesOfMoreDigits) {
    const std::pair<int, std::uint64_t> rows[] = {
        {1, 100},     {1, 255},      {2, 10000},     {2, 0xFFFF},
        {3, 1000000}, {3, 0xFFFFFF}, {4, 100000000}, {4, 0xFFFFFFFF},
    };
    for (const auto& [size, value] : rows) {
        EXPECT_EQ(Bytes{}, Converted(LittleEndian(value, size), "bcd", Items(size), kWrite))
            << value;
    }
}

TEST(ConversionsBcdTest, WritesItemsOfFourBytesAtMost) {
    for (int size = 1; size <= 10; ++size) {
        EXPECT_EQ(size > 4, Refuses("bcd", Items(size), kWrite)) << size;
        EXPECT_FALSE(Refuses("bcd", Items(size), kRead)) << size;
    }
}

TEST(ConversionsBcdTest, ConvertsEveryItem) {
    EXPECT_EQ((Bytes{0xD2, 0x04, 0x2E, 0x16}),
              Converted({0x34, 0x12, 0x78, 0x56}, "bcd", Items(2, 2), kRead));
    EXPECT_EQ((Bytes{0x34, 0x12, 0x78, 0x56}),
              Converted({0xD2, 0x04, 0x2E, 0x16}, "bcd", Items(2, 2), kWrite));
    EXPECT_EQ(Bytes{}, Converted({0x34, 0x12, 0x7A, 0x56}, "bcd", Items(2, 2), kRead));
}

TEST(ConversionsBcdTest, LeavesAnItemWithoutLengthAlone) {
    EXPECT_EQ((Bytes{0xFF, 0xFF}),
              Converted({0xFF, 0xFF}, "bcd", {2, 0, 1, ICU_Type::object}, kRead));
}

TEST(ConversionsBcdTest, RoundTripsEveryTwoByteNumber) {
    for (unsigned value = 0; value <= 9999; ++value) {
        const Bytes written = Converted(LittleEndian(value, 2), "bcd", Items(2), kWrite);
        ASSERT_EQ(2U, written.size()) << value;
        ASSERT_EQ(LittleEndian(value, 2), Converted(written, "bcd", Items(2), kRead)) << value;
    }
}

}  // namespace
