#include "engine/Footprint.h"

#include <gtest/gtest.h>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using engine::BitRange;
using engine::Footprint;

const ProtgenTag& make(FakeDriver& driver, const std::string& uri) {
    return *static_cast<const ProtgenTag*>(driver.tag(uri));
}

}  // namespace

namespace engine {

void PrintTo(const BitRange& range, std::ostream* out) {
    *out << "[" << range.begin << ", " << range.end << ")";
}

void PrintTo(const Footprint& place, std::ostream* out) {
    *out << place.address << "+" << place.count << " bit " << place.firstBit << " bytes "
         << place.bytes << (place.partial ? " partial" : "");
}

}  // namespace engine

TEST(FootprintTest, WholeTagCoversItsItems) {
    struct Row {
        const char* uri;
        BitRange range;
        Footprint place;
    };
    constexpr Row kRows[] = {
        {"1?REG?5?short", {0, 16}, {5, 1, 0, 2, false}},
        {"1?REG?5?byte", {0, 8}, {5, 1, 0, 2, true}},
        {"1?REG?5?string-3", {0, 24}, {5, 2, 0, 4, true}},
        {"1?REG?5?double", {0, 64}, {5, 4, 0, 8, false}},
        {"1?REG?5.9?short", {0, 16}, {5, 1, 0, 2, false}},
        {"1?REG?5.3?boolean", {3, 4}, {5, 1, 0, 2, true}},
        {"1?REG?5.15?boolean-2", {15, 17}, {5, 2, 0, 4, true}},
        {"1?REG?5?boolean-16", {0, 16}, {5, 1, 0, 2, false}},
        {"1?REG?5.16?boolean-32", {16, 48}, {6, 2, 16, 4, false}},
        {"1?REG?5.40?boolean", {40, 41}, {7, 1, 32, 2, true}},
        {"1?LONG?5?short", {0, 16}, {5, 1, 0, 4, true}},
        {"1?LONG?5.33?boolean", {33, 34}, {6, 1, 32, 4, true}},
        {"1?BYTE?5?string-3", {0, 24}, {5, 3, 0, 3, false}},
        {"1?COIL?21?boolean-10", {5, 15}, {21, 10, 0, 2, false}},
        {"1?COIL?16?unsignedByte", {0, 8}, {16, 8, 0, 1, false}},
    };
    FakeDriver driver;
    for (const Row& row : kRows) {
        const ProtgenTag& tag = make(driver, row.uri);
        EXPECT_EQ(row.range, engine::wholeTag(tag)) << row.uri;
        EXPECT_EQ(row.place, engine::footprint(tag, row.range)) << row.uri;
    }
}

TEST(FootprintTest, ArrayItemTakesItsSwapPartnersAlong) {
    struct Row {
        const char* uri;
        int index;
        BitRange range;
    };
    constexpr Row kRows[] = {
        {"1?REG?0?short-8", 3, {48, 64}},
        {"1?REG?0?short-8(swap2)", 3, {48, 64}},
        {"1?REG?0?short-8(swap4)", 3, {32, 64}},
        {"1?REG?0?short-8(swap8)", 3, {0, 64}},
        {"1?REG?0?short-8(swap2,swap8,bcd)", 5, {64, 128}},
        {"1?REG?0?double-2(swap2)", 1, {64, 128}},
        {"1?REG?0?string-8(swap2)", 5, {32, 48}},
        {"1?REG?0?string-7(swap2)", 6, {48, 56}},
        {"1?REG?0.5?boolean-8", 6, {11, 12}},
        {"1?REG?0.5?boolean-8(swap4)", 6, {9, 13}},
        {"1?COIL?11?boolean-8", 6, {9, 10}},
        {"1?REG?0?time-4(swap4)", 1, {64, 160}},
    };
    FakeDriver driver;
    for (const Row& row : kRows) {
        EXPECT_EQ(row.range, engine::arrayItem(make(driver, row.uri), row.index))
            << row.uri << " item " << row.index;
    }
}

TEST(FootprintTest, PartOfABitMemoryKeepsTheBitPosition) {
    FakeDriver driver;
    const ProtgenTag& tag = make(driver, "1?COIL?11?boolean-20");
    EXPECT_EQ((Footprint{17, 1, 8, 1, false}), engine::footprint(tag, {9, 10}));
    EXPECT_EQ((Footprint{15, 2, 0, 2, false}), engine::footprint(tag, {7, 9}));
}

TEST(FootprintTest, BufferByteFollowsTheItem) {
    FakeDriver driver;
    EXPECT_EQ(14, engine::byteOfItem(make(driver, "1?REG?5?short"), 5, 7));
    EXPECT_EQ(28, engine::byteOfItem(make(driver, "1?LONG?5?int"), 5, 7));
    EXPECT_EQ(0, engine::byteOfItem(make(driver, "1?COIL?5?boolean"), 5, 2));
    EXPECT_EQ(1, engine::byteOfItem(make(driver, "1?COIL?5?boolean"), 5, 3));
    EXPECT_EQ(250, engine::byteOfItem(make(driver, "1?COIL?5?boolean"), 5, 2000));
}

TEST(FootprintTest, FaultsAreNamed) {
    struct Row {
        const char* uri;
        const char* fault;
    };
    constexpr Row kRows[] = {
        {"1?REG?0?short", nullptr},
        {"1?REG?65535?short", nullptr},
        {"1?REG?65535?int", "Tag exceeds the memory area"},
        {"1?REG?65535.15?boolean", nullptr},
        {"1?REG?65535.16?boolean", "Tag exceeds the memory area"},
        {"1?REG?65533?string-5", nullptr},
        {"1?REG?65533?string-7", "Tag exceeds the memory area"},
        {"1?REG?-1?short", "Tag exceeds the memory area"},
        {"1?REG?0?int-100000", "Tag exceeds the memory area"},
        {"1?REG?0.2147483647?boolean-2147483647", "Tag exceeds the memory area"},
        {"1?COIL?65535?boolean", nullptr},
        {"1?COIL?65535?boolean-2", "Tag exceeds the memory area"},
        {"1?SMALL?9?boolean", nullptr},
        {"1?SMALL?10?boolean", "Tag exceeds the memory area"},
        {"1?COIL?-1?boolean", "Tag exceeds the memory area"},
        {"1?REG?0?int-0", "Tag length is not positive"},
        {"1?REG?0?int--3", "Tag length is not positive"},
        {"1?COIL?0?boolean-0", "Tag length is not positive"},
        {"1?REG?0.-1?boolean", "Tag's bit index is negative"},
        {"1?REG?0.-1?short", nullptr},
        {"1?COIL?3?unsignedByte", "Only bits may begin inside a byte"},
        {"1?COIL?8?unsignedByte", nullptr},
        {"1?FLAG?0?unsignedByte", nullptr},
        {"1?AREA?-1?unsignedInt", "Tag exceeds the memory area"},
        {"1?AREA?0?string-2000000000", "Tag exceeds the memory area"},
        {"1?NOWHERE?0?short", "Tag has no memory type"},
    };
    FakeDriver driver;
    for (const Row& row : kRows) {
        const ProtgenTag& tag = make(driver, row.uri);
        EXPECT_STREQ(row.fault, engine::accessFault(tag, engine::itemsOfTag(tag), false))
            << row.uri;
    }
}
