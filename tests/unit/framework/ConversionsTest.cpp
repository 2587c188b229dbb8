#include "framework/Conversions.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "framework/DataTypes.h"

namespace {

using Bytes = std::vector<unsigned char>;
using ProtUtilsN::ConversionShape;

constexpr bool kRead = false;
constexpr bool kWrite = true;

ConversionShape Shape(ICU_Type itemType, int items = 1) {
    const int size = ProtUtilsN::GetDataLength(itemType);
    return {size * items, size, items, itemType};
}

// Byte values without meaning as a number, for the conversions that look at the length alone.
ConversionShape Raw(int length) {
    return {length, 1, length, ICU_Type::unsignedByte};
}

// What becomes of the bytes; empty when the conversion refuses them.
Bytes Converted(Bytes bytes, const char* name, const ConversionShape& shape, bool toDevice) {
    const bool ok = ProtUtilsN::ApplyConversion(bytes.data(), name, shape, toDevice);
    return ok ? bytes : Bytes{};
}

bool Refuses(const char* name, const ConversionShape& shape, bool toDevice) {
    Bytes bytes(static_cast<std::size_t>(std::max(shape.length, 1)), 0);
    return !ProtUtilsN::ApplyConversion(bytes.data(), name, shape, toDevice);
}

Bytes LittleEndian(std::uint64_t value, int size) {
    Bytes bytes;
    for (int k = 0; k < size; ++k)
        bytes.push_back(static_cast<unsigned char>(value >> (8 * k)));
    return bytes;
}

TEST(Conversion, OfAnUnknownNameIsRefused) {
    for (const char* name : {"", "swap3", "Swap2", "swap2 ", " bcd", "swap", "swap22", "BCD"}) {
        EXPECT_TRUE(Refuses(name, Shape(ICU_Type::int_), kRead)) << name;
        EXPECT_TRUE(Refuses(name, Shape(ICU_Type::int_), kWrite)) << name;
    }
    EXPECT_TRUE(Refuses(nullptr, Shape(ICU_Type::int_), kRead));
}

TEST(Swaps, ReorderBytesInTheirGroups) {
    struct Row {
        const char* name;
        Bytes from;
        Bytes to;
    };
    const Row rows[] = {
        {"swapnibble", {0x12}, {0x21}},
        {"swapnibble", {0x12, 0xF0, 0xAB}, {0x21, 0x0F, 0xBA}},
        {"swap2", {1, 2}, {2, 1}},
        {"swap2", {1, 2, 3, 4, 5, 6}, {2, 1, 4, 3, 6, 5}},
        {"swap4", {1, 2, 3, 4}, {4, 3, 2, 1}},
        {"swap4", {1, 2, 3, 4, 5, 6, 7, 8}, {4, 3, 2, 1, 8, 7, 6, 5}},
        {"swap8", {1, 2, 3, 4, 5, 6, 7, 8}, {8, 7, 6, 5, 4, 3, 2, 1}},
    };
    for (const Row& row : rows) {
        const ConversionShape shape = Raw(static_cast<int>(row.from.size()));
        for (const bool toDevice : {kRead, kWrite}) {
            EXPECT_EQ(Converted(row.from, row.name, shape, toDevice), row.to) << row.name;
            EXPECT_EQ(Converted(row.to, row.name, shape, toDevice), row.from) << row.name;
        }
    }
}

TEST(Swaps, RefuseLengthsThatAreNoMultiple) {
    const std::pair<const char*, int> groups[] = {
        {"swapnibble", 1}, {"swap2", 2}, {"swap4", 4}, {"swap8", 8}};
    for (const auto& [name, group] : groups) {
        for (int length = 1; length <= 24; ++length) {
            EXPECT_EQ(Refuses(name, Raw(length), kRead), length % group != 0)
                << name << ' ' << length;
        }
    }
}

TEST(Conversions, WithoutALengthChangeNothing) {
    for (const char* name : {"swapnibble", "swap2", "swap4", "swap8", "inv", "bcd"}) {
        for (const int length : {0, -1, -3, std::numeric_limits<int>::min()}) {
            EXPECT_EQ(Converted({0x12}, name, Raw(length), kRead), Bytes{0x12})
                << name << ' ' << length;
            EXPECT_EQ(Converted({0x12}, name, Raw(length), kWrite), Bytes{0x12})
                << name << ' ' << length;
        }
    }
}

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

TEST(Bcd, TurnsDigitsIntoNumbersAndBack) {
    for (const BcdRow& row : kBcd) {
        const Bytes digits = LittleEndian(row.digits, row.size);
        const Bytes value = LittleEndian(row.value, row.size);
        EXPECT_EQ(Converted(digits, "bcd", Items(row.size), kRead), value) << row.digits;
        EXPECT_EQ(Converted(value, "bcd", Items(row.size), kWrite), digits) << row.value;
    }
}

TEST(Bcd, ReadsLowByteFirst) {
    EXPECT_EQ(Converted({0x34, 0x12}, "bcd", Shape(ICU_Type::short_), kRead), (Bytes{0xD2, 0x04}));
}

TEST(Bcd, ReadsEightBytesAndTheTenOfATime) {
    EXPECT_EQ(Converted(LittleEndian(0x9876543210123456U, 8), "bcd", Items(8), kRead),
              LittleEndian(9876543210123456U, 8));
    // 99999999999999999999 = 0x56BC75E2D630FFFFF has 67 bits
    EXPECT_EQ(Converted(Bytes(10, 0x99), "bcd", Shape(ICU_Type::time), kRead),
              (Bytes{0xFF, 0xFF, 0x0F, 0x63, 0x2D, 0x5E, 0xC7, 0x6B, 0x05, 0x00}));
}

TEST(Bcd, RefusesEveryNibbleAboveNine) {
    for (int byte = 0; byte < 256; ++byte) {
        const bool digits = byte % 16 <= 9 && byte / 16 <= 9;
        for (std::size_t place = 0; place < 4; ++place) {
            Bytes bytes(4, 0x11);
            bytes[place] = static_cast<unsigned char>(byte);
            EXPECT_EQ(!Converted(bytes, "bcd", Items(4), kRead).empty(), digits) << byte;
        }
    }
}

TEST(Bcd, RefusesValuesOfMoreDigits) {
    const std::pair<int, std::uint64_t> rows[] = {
        {1, 100},     {1, 255},      {2, 10000},     {2, 0xFFFF},
        {3, 1000000}, {3, 0xFFFFFF}, {4, 100000000}, {4, 0xFFFFFFFF},
    };
    for (const auto& [size, value] : rows) {
        EXPECT_EQ(Converted(LittleEndian(value, size), "bcd", Items(size), kWrite), Bytes{})
            << value;
    }
}

TEST(Bcd, WritesItemsOfFourBytesAtMost) {
    for (int size = 1; size <= 10; ++size) {
        EXPECT_EQ(Refuses("bcd", Items(size), kWrite), size > 4) << size;
        EXPECT_FALSE(Refuses("bcd", Items(size), kRead)) << size;
    }
}

TEST(Bcd, ConvertsEveryItem) {
    EXPECT_EQ(Converted({0x34, 0x12, 0x78, 0x56}, "bcd", Items(2, 2), kRead),
              (Bytes{0xD2, 0x04, 0x2E, 0x16}));
    EXPECT_EQ(Converted({0xD2, 0x04, 0x2E, 0x16}, "bcd", Items(2, 2), kWrite),
              (Bytes{0x34, 0x12, 0x78, 0x56}));
    EXPECT_EQ(Converted({0x34, 0x12, 0x7A, 0x56}, "bcd", Items(2, 2), kRead), Bytes{});
}

TEST(Bcd, LeavesAnItemWithoutLengthAlone) {
    EXPECT_EQ(Converted({0xFF, 0xFF}, "bcd", {2, 0, 1, ICU_Type::object}, kRead),
              (Bytes{0xFF, 0xFF}));
}

TEST(Bcd, RoundTripsEveryTwoByteNumber) {
    for (unsigned value = 0; value <= 9999; ++value) {
        const Bytes written = Converted(LittleEndian(value, 2), "bcd", Items(2), kWrite);
        ASSERT_EQ(written.size(), 2U) << value;
        ASSERT_EQ(Converted(written, "bcd", Items(2), kRead), LittleEndian(value, 2)) << value;
    }
}

TEST(Neg, ComplementsIntegers) {
    struct Row {
        ICU_Type type;
        std::int64_t from;
        std::int64_t to;
    };
    const Row rows[] = {
        {ICU_Type::byte, 1, -1},
        {ICU_Type::byte, 0, 0},
        {ICU_Type::byte, -128, -128},
        {ICU_Type::short_, 256, -256},
        {ICU_Type::short_, INT16_MIN, INT16_MIN},
        {ICU_Type::short_, -32767, 32767},
        {ICU_Type::int_, 65536, -65536},
        {ICU_Type::int_, INT32_MIN, INT32_MIN},
        {ICU_Type::int_, 0, 0},
        {ICU_Type::int64, 4294967296, -4294967296},
        {ICU_Type::int64, INT64_MIN, INT64_MIN},
        {ICU_Type::int64, INT64_MAX, -INT64_MAX},
    };
    for (const Row& row : rows) {
        const int size = ProtUtilsN::GetDataLength(row.type);
        const Bytes from = LittleEndian(static_cast<std::uint64_t>(row.from), size);
        const Bytes to = LittleEndian(static_cast<std::uint64_t>(row.to), size);
        for (const bool toDevice : {kRead, kWrite}) {
            EXPECT_EQ(Converted(from, "neg", Shape(row.type), toDevice), to) << row.from;
            EXPECT_EQ(Converted(to, "neg", Shape(row.type), toDevice), from) << row.from;
        }
    }
}

TEST(Neg, FlipsTheSignOfFloatsAndDoubles) {
    for (const float value : {1.5F, 0.0F, -3.25e30F, std::numeric_limits<float>::infinity()}) {
        EXPECT_EQ(Converted(LittleEndian(std::bit_cast<std::uint32_t>(value), 4), "neg",
                            Shape(ICU_Type::float_), kRead),
                  LittleEndian(std::bit_cast<std::uint32_t>(-value), 4))
            << value;
    }
    for (const double value : {1.5, 0.0, -3.25e300, std::numeric_limits<double>::denorm_min()}) {
        EXPECT_EQ(Converted(LittleEndian(std::bit_cast<std::uint64_t>(value), 8), "neg",
                            Shape(ICU_Type::double_), kWrite),
                  LittleEndian(std::bit_cast<std::uint64_t>(-value), 8))
            << value;
    }
}

// How many of `items` items, all 1, come out as -1; checks that the rest is untouched.
int NegatedItems(ICU_Type type, int items) {
    const int size = ProtUtilsN::GetDataLength(type);
    const Bytes one = LittleEndian(1, size);
    const Bytes minusOne = LittleEndian(~std::uint64_t{0}, size);
    Bytes array;
    for (int i = 0; i < items; ++i)
        array.insert(array.end(), one.begin(), one.end());
    array = Converted(array, "neg", Shape(type, items), kRead);

    int negated = 0;
    for (auto item = array.begin(); item != array.end(); item += size) {
        if (std::equal(minusOne.begin(), minusOne.end(), item)) {
            EXPECT_EQ(item - array.begin(), negated * size) << "not at the front";
            ++negated;
        } else {
            EXPECT_TRUE(std::equal(one.begin(), one.end(), item));
        }
    }
    return negated;
}

TEST(Neg, ReachesTheFrontPartOfArraysOfWiderItems) {
    struct Row {
        ICU_Type type;
        int items;
        int negated;
    };
    const Row rows[] = {
        {ICU_Type::byte, 10, 10}, {ICU_Type::byte, 1, 1},   {ICU_Type::short_, 10, 5},
        {ICU_Type::short_, 1, 1}, {ICU_Type::short_, 2, 1}, {ICU_Type::short_, 3, 2},
        {ICU_Type::int_, 10, 3},  {ICU_Type::int_, 1, 1},   {ICU_Type::int_, 4, 1},
        {ICU_Type::int_, 5, 2},   {ICU_Type::int64, 10, 2}, {ICU_Type::int64, 8, 1},
        {ICU_Type::int64, 9, 2},  {ICU_Type::int64, 1, 1},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(NegatedItems(row.type, row.items), row.negated)
            << static_cast<int>(row.type) << " x " << row.items;
    }
}

TEST(Neg, ReachesTheFrontPartOfFloatAndDoubleArrays) {
    Bytes floats(10 * 4, 0);
    floats = Converted(floats, "neg", Shape(ICU_Type::float_, 10), kRead);
    EXPECT_EQ(std::count(floats.begin(), floats.end(), 0x80), 3);
    Bytes doubles(10 * 8, 0);
    doubles = Converted(doubles, "neg", Shape(ICU_Type::double_, 10), kRead);
    EXPECT_EQ(std::count(doubles.begin(), doubles.end(), 0x80), 2);
    EXPECT_EQ(doubles[7], 0x80);
    EXPECT_EQ(doubles[15], 0x80);
}

TEST(Neg, IsForSignedTypesOnly) {
    const std::vector<int> allowed = {2, 3, 4, 8, 9, 24};
    for (int code = 0; code <= 28; ++code) {
        const ConversionShape shape{16, 1, 1, static_cast<ICU_Type>(code)};
        const bool known = std::find(allowed.begin(), allowed.end(), code) != allowed.end();
        EXPECT_EQ(Refuses("neg", shape, kRead), !known) << code;
    }
}

TEST(Neg, StaysWithinTheValue) {
    EXPECT_EQ(Converted({1, 2, 3, 4}, "neg", {3, 4, 1, ICU_Type::int_}, kRead),
              (Bytes{1, 2, 3, 4}));
}

TEST(Inv, TogglesBits) {
    for (const ICU_Type type : {ICU_Type::boolean, ICU_Type::booleanArray}) {
        EXPECT_EQ(Converted({1, 0, 1, 7}, "inv", {4, 1, 4, type}, kRead), (Bytes{0, 1, 0, 0}));
        EXPECT_EQ(Converted({1, 0, 1}, "inv", {3, 1, 3, type}, kWrite), (Bytes{0, 1, 0}));
    }
}

TEST(Inv, ComplementsUnsignedTypes) {
    const std::vector<int> bitwise = {5, 6, 7, 11, 23};
    for (int code = 0; code <= 28; ++code) {
        if (code == 1 || code == 13) continue;
        const ConversionShape shape{3, 1, 3, static_cast<ICU_Type>(code)};
        const bool known = std::find(bitwise.begin(), bitwise.end(), code) != bitwise.end();
        EXPECT_EQ(Converted({0x00, 0xFF, 0x5A}, "inv", shape, kRead),
                  known ? Bytes({0xFF, 0x00, 0xA5}) : Bytes{})
            << code;
    }
}

}  // namespace
