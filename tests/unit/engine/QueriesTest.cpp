// What the engine answers about tags without touching a device.
#include <gtest/gtest.h>

#include <array>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

class QueriesTest : public testing::Test {
  protected:
    const ITag* tag(const std::string& uri) { return driver_.tag(uri); }
    bool optimized(const char* a, const char* b, bool write) {
        return driver_.CanBeOptimized(tag(a), tag(b), write);
    }
    bool adjacent(const char* a, const char* b) { return driver_.IsAdjacent(tag(a), tag(b)); }
    bool before(const char* a, const char* b) { return driver_.IsBefore(tag(a), tag(b)); }

    FakeDriver driver_;
};

}  // namespace

TEST_F(QueriesTest, OneBlockServesTagsOfTheSameMemoryOfOneNode) {
    EXPECT_TRUE(optimized("1?REG?0?short", "1?REG?900?double", false));
    EXPECT_TRUE(optimized("1?REG?0?short", "1?REG?900?double", true));
    EXPECT_TRUE(optimized("1?COIL?0?boolean", "1?COIL?9?boolean-7", false));
}

TEST_F(QueriesTest, NodesModelsAndMemoriesNeverMix) {
    EXPECT_FALSE(optimized("1?REG?0?short", "2?REG?1?short", false));
    EXPECT_FALSE(optimized("1?REG?0?short", "9?REG?1?short", false));
    EXPECT_FALSE(optimized("1?REG?0?short", "1?IREG?1?short", false));
    EXPECT_FALSE(optimized("1?REG?0?short", "1?COIL?1?boolean", false));
    EXPECT_FALSE(optimized("1?NOWHERE?0?short", "1?NOWHERE?1?short", false));
}

TEST_F(QueriesTest, ReadOnlyMemoryIsOptimizedForReadingOnly) {
    EXPECT_TRUE(optimized("1?IREG?0?short", "1?IREG?1?short", false));
    EXPECT_FALSE(optimized("1?IREG?0?short", "1?IREG?1?short", true));
}

TEST_F(QueriesTest, AreasOfTheDriverItselfAreNotOptimized) {
    EXPECT_FALSE(optimized("1?AREA?0?unsignedInt", "1?AREA?0?unsignedInt", false));
    EXPECT_FALSE(optimized("1?FLAG?0?boolean", "1?FLAG?0?boolean", true));
}

TEST_F(QueriesTest, TagThatCannotBeReadAloneSharesNoBlock) {
    for (const char* uri : {"1?REG?65535?int", "1?REG?-1?short", "1?REG?0?short-0",
                            "1?REG?0.-1?boolean", "1?NOWHERE?0?short"}) {
        EXPECT_FALSE(optimized(uri, "1?REG?0?short", false)) << uri;
        EXPECT_FALSE(optimized("1?REG?0?short", uri, false)) << uri;
        EXPECT_FALSE(optimized("1?REG?0?short", uri, true)) << uri;
    }
    EXPECT_TRUE(optimized("1?REG?65535?short", "1?REG?0?short", false));
    EXPECT_FALSE(optimized("1?COIL?65535?boolean", "1?COIL?65535?boolean-2", false));
}

TEST_F(QueriesTest, RegisterTagsAreOrderedByTheirFirstItemThenByBit) {
    EXPECT_TRUE(before("1?REG?1?short", "1?REG?2?short"));
    EXPECT_FALSE(before("1?REG?2?short", "1?REG?2?int"));
    EXPECT_TRUE(before("1?REG?2.3?boolean", "1?REG?2.4?boolean"));
    EXPECT_FALSE(before("1?REG?2.4?boolean", "1?REG?2.3?boolean"));
    EXPECT_TRUE(before("1?REG?2.17?boolean", "1?REG?3.0?boolean"))
        << "a block that begins with register 3 does not hold the other's image";
    EXPECT_FALSE(before("1?REG?3.0?boolean", "1?REG?2.17?boolean"));
    EXPECT_FALSE(before("1?REG?2.0?short", "1?REG?2.9?short")) << "no bits, no sub-index";
}

TEST_F(QueriesTest, BitTagsAreOrderedByTheirBit) {
    EXPECT_TRUE(before("1?COIL?8?boolean", "1?COIL?9?boolean"));
    EXPECT_FALSE(before("1?COIL?9?boolean", "1?COIL?8?boolean"));
    EXPECT_FALSE(before("1?COIL?9.1?boolean", "1?COIL?9.2?boolean"));
}

TEST_F(QueriesTest, RegisterTagIsAdjacentToTheOneWhoseRegistersEndWhereItBegins) {
    EXPECT_TRUE(adjacent("1?REG?11?short", "1?REG?10?short"));
    EXPECT_FALSE(adjacent("1?REG?12?short", "1?REG?10?short")) << "register 11 lies between";
    EXPECT_TRUE(adjacent("1?REG?12?short", "1?REG?10?int"));
    EXPECT_FALSE(adjacent("1?REG?10?short", "1?REG?11?short"));
    EXPECT_FALSE(adjacent("1?REG?10?short", "1?REG?10?short"));
    EXPECT_FALSE(adjacent("1?REG?11?short", "1?REG?10?byte")) << "half a register lies between";
    EXPECT_TRUE(adjacent("1?LONG?11?int", "1?LONG?10?int"));
    EXPECT_FALSE(adjacent("1?LONG?14?int", "1?LONG?10?int"));
}

TEST_F(QueriesTest, BitsOfRegistersAreAdjacentWhereTheirImagesFitTogether) {
    EXPECT_TRUE(adjacent("1?REG?10.4?boolean", "1?REG?10.3?boolean"));
    EXPECT_TRUE(adjacent("1?REG?10.16?boolean", "1?REG?10.15?boolean"));
    EXPECT_TRUE(adjacent("1?REG?11.0?boolean", "1?REG?10.15?boolean"));
    EXPECT_TRUE(adjacent("1?REG?11?short", "1?REG?10.0?boolean-16"));
    EXPECT_TRUE(adjacent("1?REG?11.9?short", "1?REG?10?short")) << "no bits, no sub-index";
    EXPECT_FALSE(adjacent("1?REG?11?short", "1?REG?10.14?boolean"));
    EXPECT_FALSE(adjacent("1?REG?11.16?boolean", "1?REG?10.31?boolean"))
        << "the image of the first begins in the middle of the other's";
}

TEST_F(QueriesTest, CoilsAreAdjacentByTheirNumbers) {
    EXPECT_TRUE(adjacent("1?COIL?8?boolean", "1?COIL?7?boolean"));
    EXPECT_TRUE(adjacent("1?COIL?19?boolean", "1?COIL?9?boolean-10"));
    EXPECT_FALSE(adjacent("1?COIL?9?boolean", "1?COIL?7?boolean"));
}

TEST_F(QueriesTest, TagsOfOtherNodesAndMemoriesAreNotAdjacent) {
    EXPECT_FALSE(adjacent("2?REG?11?short", "1?REG?10?short"));
    EXPECT_FALSE(adjacent("1?IREG?11?short", "1?REG?10?short"));
}

TEST_F(QueriesTest, NodeIsTheTagsNode) {
    EXPECT_EQ(7, driver_.GetNodeID(tag("7?REG?0?short")));
}

TEST_F(QueriesTest, BitBlocksBelongToBitMemories) {
    EXPECT_TRUE(driver_.CanReadBitBlock(tag("1?COIL?0?boolean")));
    EXPECT_TRUE(driver_.CanWriteBitBlock(tag("1?COIL?0?boolean")));
    EXPECT_FALSE(driver_.CanReadBitBlock(tag("1?REG?0?boolean")));
    EXPECT_FALSE(driver_.CanWriteBitBlock(tag("1?REG?0?boolean")));
}

TEST_F(QueriesTest, PartOfARegisterNeedsAReadBeforeAWrite) {
    struct Row {
        const char* uri;
        bool needed;
    };
    constexpr Row kRows[] = {
        {"1?REG?0?short", false},         {"1?REG?0?byte", true},
        {"1?REG?0?string-3", true},       {"1?REG?0?string-4", false},
        {"1?REG?0.3?boolean", true},      {"1?REG?0.3?boolean-16", true},
        {"1?REG?0?boolean-16", false},    {"1?LONG?0?short", true},
        {"1?LONG?0?float", false},        {"1?COIL?3?boolean", false},
        {"1?COIL?3?boolean-9", false},    {"1?IREG?0?byte", false},
        {"1?AREA?0?unsignedByte", false}, {"1?FLAG?0?unsignedByte", false},
        {"1?REG?0?int-0", false},         {"1?NOWHERE?0?byte", false},
    };
    for (const Row& row : kRows)
        EXPECT_EQ(row.needed, driver_.NeedsReadBeforeWrite(tag(row.uri))) << row.uri;
}

TEST_F(QueriesTest, BitLimitFollowsTheItemLimit) {
    const auto* coil = static_cast<const ProtgenTag*>(tag("1?COIL?0?boolean"));
    EXPECT_EQ(2000, driver_.getMaxBitCount(coil, false));
    EXPECT_EQ(1968, driver_.getMaxBitCount(coil, true));
}

TEST_F(QueriesTest, ItemsOfArraysAreNotAddressedUnlessTheDriverSaysSo) {
    EXPECT_EQ(0, driver_.ProtgenProtocol::arrayItemByTag());
}

TEST_F(QueriesTest, DatagramLimitsComeFromTheModel) {
    EXPECT_EQ(3, driver_.MaxDatagramItems(tag("1?REG?0?short")));
    EXPECT_EQ(10, driver_.MaxDatagramLength(tag("1?REG?0?short")));
    const ProtgenTag loose("1?REG?0?short", nullptr);
    EXPECT_EQ(0, driver_.MaxDatagramItems(&loose));
    EXPECT_EQ(0, driver_.MaxDatagramLength(&loose));
}

TEST_F(QueriesTest, DatagramHoldsTagsOfOneNodeWhoseMemoriesTakePart) {
    const ITag* reg = tag("1?REG?0?short");
    EXPECT_TRUE(driver_.CanCoexistInDatagram(reg, tag("1?LONG?0?int")));
    EXPECT_FALSE(driver_.CanCoexistInDatagram(reg, tag("1?COIL?0?boolean")));
    EXPECT_FALSE(driver_.CanCoexistInDatagram(tag("1?COIL?0?boolean"), reg));
    EXPECT_FALSE(driver_.CanCoexistInDatagram(reg, tag("2?REG?0?short")));
    EXPECT_FALSE(driver_.CanCoexistInDatagram(reg, tag("9?REG?0?short")));
    EXPECT_FALSE(driver_.CanCoexistInDatagram(reg, tag("1?NOWHERE?0?short")));
}

TEST_F(QueriesTest, DatagramGrowsToItsLimits) {
    const std::array<const ITag*, 3> tags = {tag("1?REG?0?int"), tag("1?REG?4?int"),
                                             tag("1?REG?8?byte")};
    EXPECT_TRUE(driver_.CanAddToDatagram(tags.data(), 0, tags[0]));
    EXPECT_TRUE(driver_.CanAddToDatagram(tags.data(), 2, tag("1?REG?9?short")));
    EXPECT_FALSE(driver_.CanAddToDatagram(tags.data(), 2, tag("1?REG?9?int"))) << "12 bytes of 10";
    EXPECT_FALSE(driver_.CanAddToDatagram(tags.data(), 3, tag("1?REG?9?byte"))) << "4 tags of 3";
    EXPECT_FALSE(driver_.CanAddToDatagram(tags.data(), 1, tag("2?REG?9?byte")));
}

TEST_F(QueriesTest, DatagramReadIsRefusedUnlessTheDriverHasIt) {
    const ITag* reg = tag("1?REG?0?short");
    unsigned char data[2] = {7, 7};
    idal_error_t status = 5;
    EXPECT_EQ(0, driver_.ReadDatagram(&reg, 1, data));
    EXPECT_EQ(-3, driver_.GetLastError());
    EXPECT_STREQ("Datagrams not supported", driver_.GetLastErrorString());
    EXPECT_EQ(0, driver_.ReadDatagramWithStatus(&reg, 1, data, &status));
    EXPECT_EQ(5, status);
    EXPECT_EQ(7, data[0]);
    EXPECT_EQ("", driver_.calls());
}

namespace {

class DatagramDriver : public FakeDriver {
  public:
    bool doReadDatagram(const ProtgenTag* const* tags, int count, unsigned char* data,
                        idal_error_t* status) override {
        for (int i = 0; i < count; ++i) {
            data[i] = static_cast<unsigned char>(tags[i]->offset());
            status[i] = kItemDone;
        }
        return true;
    }
};

}  // namespace

TEST_F(QueriesTest, DatagramHookReceivesTheTagsAndStoresTheStatus) {
    DatagramDriver driver;
    const std::array<const ITag*, 2> tags = {driver.tag("1?REG?4?byte"),
                                             driver.tag("1?REG?6?byte")};
    std::array<unsigned char, 2> data{};
    std::array<idal_error_t, 2> status{};
    EXPECT_NE(driver.ReadDatagramWithStatus(tags.data(), 2, data.data(), status.data()), 0);
    EXPECT_EQ((std::array<unsigned char, 2>{4, 6}), data);
    EXPECT_EQ((std::array<idal_error_t, 2>{kItemDone, kItemDone}), status);
    data = {};
    EXPECT_NE(driver.ReadDatagram(tags.data(), 2, data.data()), 0);
    EXPECT_EQ((std::array<unsigned char, 2>{4, 6}), data);
}
