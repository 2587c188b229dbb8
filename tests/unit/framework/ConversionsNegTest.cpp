#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cstdint>
#include <limits>
#include <vector>

#include "tests/unit/framework/ConversionsFixture.h"

namespace {

using namespace conversions_test;

TEST(ConversionsNegTest, ComplementsIntegers) {
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
            EXPECT_EQ(to, Converted(from, "neg", Shape(row.type), toDevice)) << row.from;
            EXPECT_EQ(from, Converted(to, "neg", Shape(row.type), toDevice)) << row.from;
        }
    }
}

TEST(ConversionsNegTest, FlipsTheSignOfFloatsAndDoubles) {
    for (const float value : {1.5F, 0.0F, -3.25e30F, std::numeric_limits<float>::infinity()}) {
        EXPECT_EQ(LittleEndian(std::bit_cast<std::uint32_t>(-value), 4),
                  Converted(LittleEndian(std::bit_cast<std::uint32_t>(value), 4), "neg",
                            Shape(ICU_Type::float_), kRead))
            << value;
    }
    for (const double value : {1.5, 0.0, -3.25e300, std::numeric_limits<double>::denorm_min()}) {
        EXPECT_EQ(LittleEndian(std::bit_cast<std::uint64_t>(-value), 8),
                  Converted(LittleEndian(std::bit_cast<std::uint64_t>(value), 8), "neg",
                            Shape(ICU_Type::double_), kWrite))
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
            EXPECT_EQ(negated * size, item - array.begin()) << "not at the front";
            ++negated;
        } else {
            EXPECT_TRUE(std::equal(one.begin(), one.end(), item));
        }
    }
    return negated;
}

TEST(ConversionsNegTest, ReachesTheFrontPartOfArraysOfWiderItems) {
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

TEST(ConversionsNegTest, ReachesTheFrontPartOfFloatAndDoubleArrays) {
    Bytes floats(std::size_t{10} * 4, 0);
    floats = Converted(floats, "neg", Shape(ICU_Type::float_, 10), kRead);
    EXPECT_EQ(3, std::count(floats.begin(), floats.end(), 0x80));
    Bytes doubles(std::size_t{10} * 8, 0);
    doubles = Converted(doubles, "neg", Shape(ICU_Type::double_, 10), kRead);
    EXPECT_EQ(2, std::count(doubles.begin(), doubles.end(), 0x80));
    EXPECT_EQ(0x80, doubles[7]);
    EXPECT_EQ(0x80, doubles[15]);
}

TEST(ConversionsNegTest, IsForSignedTypesOnly) {
    const std::vector<int> allowed = {2, 3, 4, 8, 9, 24};
    for (int code = 0; code <= 28; ++code) {
        const ConversionShape shape{16, 1, 1, static_cast<ICU_Type>(code)};
        const bool known = std::find(allowed.begin(), allowed.end(), code) != allowed.end();
        EXPECT_EQ(!known, Refuses("neg", shape, kRead)) << code;
    }
}

TEST(ConversionsNegTest, StaysWithinTheValue) {
    EXPECT_EQ((Bytes{1, 2, 3, 4}),
              Converted({1, 2, 3, 4}, "neg", {3, 4, 1, ICU_Type::int_}, kRead));
}

}  // namespace
