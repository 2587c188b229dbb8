#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <utility>
#include <vector>

#include "tests/unit/framework/ConversionsFixture.h"

namespace {

using namespace conversions_test;

TEST(ConversionsTest, ConversionOfAnUnknownNameIsRefused) {
    for (const char* name : {"", "swap3", "Swap2", "swap2 ", " bcd", "swap", "swap22", "BCD"}) {
        EXPECT_TRUE(Refuses(name, Shape(ICU_Type::int_), kRead)) << name;
        EXPECT_TRUE(Refuses(name, Shape(ICU_Type::int_), kWrite)) << name;
    }
    EXPECT_TRUE(Refuses(nullptr, Shape(ICU_Type::int_), kRead));
}

TEST(ConversionsTest, SwapsReorderBytesInTheirGroups) {
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
            EXPECT_EQ(row.to, Converted(row.from, row.name, shape, toDevice)) << row.name;
            EXPECT_EQ(row.from, Converted(row.to, row.name, shape, toDevice)) << row.name;
        }
    }
}

TEST(ConversionsTest, SwapsRefuseLengthsThatAreNoMultiple) {
    const std::pair<const char*, int> groups[] = {
        {"swapnibble", 1}, {"swap2", 2}, {"swap4", 4}, {"swap8", 8}};
    for (const auto& [name, group] : groups) {
        for (int length = 1; length <= 24; ++length) {
            EXPECT_EQ(length % group != 0, Refuses(name, Raw(length), kRead))
                << name << ' ' << length;
        }
    }
}

TEST(ConversionsTest, WithoutALengthChangeNothing) {
    for (const char* name : {"swapnibble", "swap2", "swap4", "swap8", "inv", "bcd"}) {
        for (const int length : {0, -1, -3, std::numeric_limits<int>::min()}) {
            EXPECT_EQ(Bytes{0x12}, Converted({0x12}, name, Raw(length), kRead))
                << name << ' ' << length;
            EXPECT_EQ(Bytes{0x12}, Converted({0x12}, name, Raw(length), kWrite))
                << name << ' ' << length;
        }
    }
}

TEST(ConversionsTest, InvTogglesBits) {
    for (const ICU_Type type : {ICU_Type::boolean, ICU_Type::booleanArray}) {
        EXPECT_EQ((Bytes{0, 1, 0, 0}), Converted({1, 0, 1, 7}, "inv", {4, 1, 4, type}, kRead));
        EXPECT_EQ((Bytes{0, 1, 0}), Converted({1, 0, 1}, "inv", {3, 1, 3, type}, kWrite));
    }
}

TEST(ConversionsTest, InvComplementsUnsignedTypes) {
    const std::vector<int> bitwise = {5, 6, 7, 11, 23};
    for (int code = 0; code <= 28; ++code) {
        if (code == 1 || code == 13) continue;
        const ConversionShape shape{3, 1, 3, static_cast<ICU_Type>(code)};
        const bool known = std::find(bitwise.begin(), bitwise.end(), code) != bitwise.end();
        EXPECT_EQ(known ? Bytes({0xFF, 0x00, 0xA5}) : Bytes{},
                  Converted({0x00, 0xFF, 0x5A}, "inv", shape, kRead))
            << code;
    }
}

}  // namespace
