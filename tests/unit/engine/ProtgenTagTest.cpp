#include "engine/ProtgenTag.h"

#include <gtest/gtest.h>

#include <limits>
#include <memory>

#include "framework/BitUtils.h"
#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

constexpr const char* kFields[] = {"nodeid", "memorytype", "arrayindex.subindex", "datatype",
                                   nullptr};

const ProtgenTag& asProtgen(const ITag* tag) {
    return *static_cast<const ProtgenTag*>(tag);
}

}  // namespace

TEST(ProtgenTag, AddressFieldGivesOffsetAndSubIndex) {
    struct Row {
        const char* uri;
        int offset;
        int subIndex;
    };
    constexpr Row kRows[] = {
        {"1?HREG?400010?short", 400010, 0},
        {"1?HREG?400010.3?boolean", 400010, 3},
        {"1?HREG? 400010.15 ?boolean", 400010, 15},
        {"1?HREG?0x10.0xA?boolean", 16, 10},
        {"1?HREG?010.010?boolean", 8, 8},
        {"1?HREG?7.?boolean", 7, 0},
        {"1?HREG?.5?boolean", 0, 5},
        {"1?HREG?7.5.9?boolean", 7, 5},
        {"1?HREG?-7.-5?boolean", -7, -5},
        {"1?HREG?12ab?boolean", 12, 0},
        {"1?HREG??boolean", 0, 0},
        {"1?HREG", 0, 0},
        {"", 0, 0},
        {nullptr, 0, 0},
    };
    for (const Row& row : kRows) {
        const ProtgenTag tag(row.uri, kFields);
        SCOPED_TRACE(row.uri != nullptr ? row.uri : "(null)");
        EXPECT_EQ(tag.offset(), row.offset);
        EXPECT_EQ(tag.subIndex(), row.subIndex);
        EXPECT_STREQ(tag.GetVarName(), row.uri != nullptr ? row.uri : "");
    }
}

TEST(ProtgenTag, AddressFieldIsFoundByName) {
    constexpr const char* kOther[] = {"arrayindex.subindex", "memorytype", nullptr};
    EXPECT_EQ(ProtgenTag("5.2?REG", kOther).offset(), 5);
    EXPECT_EQ(ProtgenTag("5.2?REG", kOther).subIndex(), 2);
    constexpr const char* kNone[] = {"address", nullptr};
    EXPECT_EQ(ProtgenTag("5.2?REG", kNone).offset(), 0);
    EXPECT_EQ(ProtgenTag("5.2?REG", nullptr).offset(), 0);
}

TEST(ProtgenTag, RegisterTagKeepsItemAddressAndSubIndex) {
    FakeDriver driver;
    const ITag* tag = driver.tag("1?REG?1000.21?boolean-4");
    EXPECT_EQ(tag->GetByteOffset(), 1000U);
    EXPECT_EQ(tag->GetBitIndex(), 21);
}

TEST(ProtgenTag, BitMemoryTagTakesItsBitFromTheOffset) {
    FakeDriver driver;
    const ITag* tag = driver.tag("1?COIL?1003.5?boolean");
    EXPECT_EQ(tag->GetByteOffset(), 125U);
    EXPECT_EQ(tag->GetBitIndex(), 3);
    EXPECT_EQ(ProtUtilsN::getStartingBit(tag), 1003);
}

TEST(ProtgenTag, BitPositionFollowsTheNormalisedOffset) {
    FakeDriver driver;
    const std::unique_ptr<ITag> copy(driver.tag("1?COIL?1003?boolean")->Clone());
    static_cast<ProtgenTag*>(copy.get())->setOffset(14);
    EXPECT_EQ(ProtUtilsN::getStartingBit(copy.get()), 14);
}

TEST(ProtgenTag, PackedLengthReachesFromTheFirstItemToTheLastBit) {
    struct Row {
        const char* uri;
        int length;
    };
    constexpr Row kRows[] = {
        {"1?REG?0.0?boolean", 1},       {"1?REG?0.7?boolean", 1},
        {"1?REG?0.8?boolean", 2},       {"1?REG?0.15?boolean", 2},
        {"1?REG?0.16?boolean", 3},      {"1?REG?0.3?boolean-5", 1},
        {"1?REG?0.3?boolean-6", 2},     {"1?REG?0.15?boolean-18", 5},
        {"1?REG?0.3?short", 2},         {"1?REG?0?string-7", 7},
        {"1?REG?0?double-3", 24},       {"1?COIL?0?boolean", 1},
        {"1?COIL?7?boolean-2", 2},      {"1?COIL?15?boolean-2", 2},
        {"1?COIL?8.9?boolean-8", 1},    {"1?FLAG?0?unsignedByte", 1},
        {"1?REG?0?int-0", 0},           {"1?REG?0?int--3", 0},
        {"1?REG?0.3?boolean-0", 0},     {"1?COIL?7?boolean--9", 0},
        {"1?REG?0.-40?boolean-2", 0},   {"1?NOWHERE?0.20?boolean-3", 1},
        {"1?NOWHERE?0.7?boolean-3", 2},
    };
    FakeDriver driver;
    for (const Row& row : kRows)
        EXPECT_EQ(driver.tag(row.uri)->PackedLen(), row.length) << row.uri;
}

TEST(ProtgenTag, PackedLengthOfAHugeTagDoesNotWrap) {
    FakeDriver driver;
    EXPECT_EQ(driver.tag("1?REG?0.2147483647?boolean-2147483647")->PackedLen(),
              static_cast<int>((2LL * std::numeric_limits<int>::max() + 7) / 8));
}

TEST(ProtgenTag, ReadOnlyComesFromTheMemoryType) {
    FakeDriver driver;
    EXPECT_TRUE(driver.tag("1?IREG?0?short")->IsReadOnly());
    EXPECT_FALSE(driver.tag("1?REG?0?short")->IsReadOnly());
    EXPECT_FALSE(driver.tag("1?NOWHERE?0?short")->IsReadOnly());
}

TEST(ProtgenTag, ItemLengthIsThatOfTheMemory) {
    FakeDriver driver;
    EXPECT_EQ(asProtgen(driver.tag("1?REG?0?double")).memoryItemLength(), 2);
    EXPECT_EQ(asProtgen(driver.tag("1?LONG?0?double")).memoryItemLength(), 4);
    EXPECT_EQ(asProtgen(driver.tag("1?BYTE?0?double")).memoryItemLength(), 1);
    EXPECT_EQ(asProtgen(driver.tag("1?COIL?0?boolean")).memoryItemLength(), 1);
    EXPECT_EQ(asProtgen(driver.tag("1?NOWHERE?0?double")).memoryItemLength(), 1);
    EXPECT_TRUE(asProtgen(driver.tag("1?COIL?0?boolean")).inBitMemory());
    EXPECT_FALSE(asProtgen(driver.tag("1?REG?0?boolean")).inBitMemory());
    EXPECT_FALSE(asProtgen(driver.tag("1?NOWHERE?0?boolean")).inBitMemory());
}

TEST(ProtgenTag, CloneCarriesEverything) {
    FakeDriver driver;
    const ProtgenTag& tag = asProtgen(driver.tag("3?REG?20.4?short-3(swap2, neg)"));
    const std::unique_ptr<ITag> clone(tag.Clone());
    const ProtgenTag& copy = asProtgen(clone.get());
    EXPECT_STREQ(copy.GetVarName(), tag.GetVarName());
    EXPECT_EQ(copy.nodeId(), 3);
    EXPECT_EQ(copy.offset(), 20);
    EXPECT_EQ(copy.subIndex(), 4);
    EXPECT_EQ(copy.GetVarType(), ICU_Type::shortArray);
    EXPECT_EQ(copy.GetItemType(), ICU_Type::short_);
    EXPECT_EQ(copy.GetVarLength(), 6);
    EXPECT_EQ(copy.memoryType(), tag.memoryType());
    EXPECT_EQ(copy.model(), tag.model());
    EXPECT_EQ(copy.conversions(), (std::vector<std::string>{"swap2", "neg"}));
}
