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

TEST(ProtgenTagTest, AddressFieldGivesOffsetAndSubIndex) {
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
        EXPECT_EQ(row.offset, tag.offset());
        EXPECT_EQ(row.subIndex, tag.subIndex());
        EXPECT_STREQ(row.uri != nullptr ? row.uri : "", tag.GetVarName());
    }
}

TEST(ProtgenTagTest, AddressFieldIsFoundByName) {
    constexpr const char* kOther[] = {"arrayindex.subindex", "memorytype", nullptr};
    EXPECT_EQ(5, ProtgenTag("5.2?REG", kOther).offset());
    EXPECT_EQ(2, ProtgenTag("5.2?REG", kOther).subIndex());
    constexpr const char* kNone[] = {"address", nullptr};
    EXPECT_EQ(0, ProtgenTag("5.2?REG", kNone).offset());
    EXPECT_EQ(0, ProtgenTag("5.2?REG", nullptr).offset());
}

TEST(ProtgenTagTest, RegisterTagKeepsItemAddressAndSubIndex) {
    FakeDriver driver;
    const ITag* tag = driver.tag("1?REG?1000.21?boolean-4");
    EXPECT_EQ(1000U, tag->GetByteOffset());
    EXPECT_EQ(21, tag->GetBitIndex());
}

TEST(ProtgenTagTest, BitMemoryTagTakesItsBitFromTheOffset) {
    FakeDriver driver;
    const ITag* tag = driver.tag("1?COIL?1003.5?boolean");
    EXPECT_EQ(125U, tag->GetByteOffset());
    EXPECT_EQ(3, tag->GetBitIndex());
    EXPECT_EQ(1003, ProtUtilsN::getStartingBit(tag));
}

TEST(ProtgenTagTest, BitPositionFollowsTheNormalisedOffset) {
    FakeDriver driver;
    const std::unique_ptr<ITag> copy(driver.tag("1?COIL?1003?boolean")->Clone());
    static_cast<ProtgenTag*>(copy.get())->setOffset(14);
    EXPECT_EQ(14, ProtUtilsN::getStartingBit(copy.get()));
}

TEST(ProtgenTagTest, PackedLengthReachesFromTheFirstItemToTheLastBit) {
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
        EXPECT_EQ(row.length, driver.tag(row.uri)->PackedLen()) << row.uri;
}

TEST(ProtgenTagTest, PackedLengthOfAHugeTagDoesNotWrap) {
    FakeDriver driver;
    EXPECT_EQ(static_cast<int>((2LL * std::numeric_limits<int>::max() + 7) / 8),
              driver.tag("1?REG?0.2147483647?boolean-2147483647")->PackedLen());
}

TEST(ProtgenTagTest, ReadOnlyComesFromTheMemoryType) {
    FakeDriver driver;
    EXPECT_TRUE(driver.tag("1?IREG?0?short")->IsReadOnly());
    EXPECT_FALSE(driver.tag("1?REG?0?short")->IsReadOnly());
    EXPECT_FALSE(driver.tag("1?NOWHERE?0?short")->IsReadOnly());
}

TEST(ProtgenTagTest, ItemLengthIsThatOfTheMemory) {
    FakeDriver driver;
    EXPECT_EQ(2, asProtgen(driver.tag("1?REG?0?double")).memoryItemLength());
    EXPECT_EQ(4, asProtgen(driver.tag("1?LONG?0?double")).memoryItemLength());
    EXPECT_EQ(1, asProtgen(driver.tag("1?BYTE?0?double")).memoryItemLength());
    EXPECT_EQ(1, asProtgen(driver.tag("1?COIL?0?boolean")).memoryItemLength());
    EXPECT_EQ(1, asProtgen(driver.tag("1?NOWHERE?0?double")).memoryItemLength());
    EXPECT_TRUE(asProtgen(driver.tag("1?COIL?0?boolean")).inBitMemory());
    EXPECT_FALSE(asProtgen(driver.tag("1?REG?0?boolean")).inBitMemory());
    EXPECT_FALSE(asProtgen(driver.tag("1?NOWHERE?0?boolean")).inBitMemory());
}

TEST(ProtgenTagTest, CloneCarriesEverything) {
    FakeDriver driver;
    const ProtgenTag& tag = asProtgen(driver.tag("3?REG?20.4?short-3(swap2, neg)"));
    const std::unique_ptr<ITag> clone(tag.Clone());
    const ProtgenTag& copy = asProtgen(clone.get());
    EXPECT_STREQ(tag.GetVarName(), copy.GetVarName());
    EXPECT_EQ(3, copy.nodeId());
    EXPECT_EQ(20, copy.offset());
    EXPECT_EQ(4, copy.subIndex());
    EXPECT_EQ(ICU_Type::shortArray, copy.GetVarType());
    EXPECT_EQ(ICU_Type::short_, copy.GetItemType());
    EXPECT_EQ(6, copy.GetVarLength());
    EXPECT_EQ(tag.memoryType(), copy.memoryType());
    EXPECT_EQ(tag.model(), copy.model());
    EXPECT_EQ((std::vector<std::string>{"swap2", "neg"}), copy.conversions());
}
