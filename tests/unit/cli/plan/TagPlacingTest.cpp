// Where the loaded driver's tags are, and what it lets a read carry.
#include "poll/TagPlacing.h"

#include <gtest/gtest.h>

#include "cli/describe/OfflineDriver.h"

namespace poll {
namespace {

constexpr const char* kLine =
    "CfgVer=1 defNodeId=1 txMode=RTU uart=com1 baudrate=9600 parity=even stopbits=1 mode=RS-485 "
    "model=1 Node2::maxOptLen=21 Node2::maxBitOptLen=100 Node3::model=3 Node4::maxOptLen=1";

class TagPlacingTest : public testing::Test {
  protected:
    void SetUp() override { ASSERT_NE(0, driver_.protocol().Config(kLine)); }

    TagPlace place(const std::string& uri) {
        ITag* const tag = driver_.protocol().CreateTag(uri.c_str());
        EXPECT_NE(nullptr, tag) << driver_.protocol().GetLastErrorString();
        if (tag == nullptr) return {};
        const auto place = placeOf(*tag, driver_.protocol(), description_);
        driver_.protocol().FreeTag(tag);
        EXPECT_TRUE(place);
        return place.value_or(TagPlace{});
    }
    AreaLimits limits(const std::string& uri) {
        const std::vector<TagPlace> places{place(uri)};
        return limitsOf(places, settings::scanConfig("line.cfg", kLine), description_)
            .of(places[0].node, places[0].area, places[0].itemBytes);
    }

  private:
    cli::OfflineDriver driver_{PLUGIN, "MRTU"};
    settings::Description description_ = settings::parseDescription(driver_.description());
};

TEST_F(TagPlacingTest, TagsAreWhereTheDriverReadsThem) {
    struct Row {
        const char* uri;
        int node;
        const char* area;
        int itemBytes;
        long first;
        long items;
    };
    const std::vector<Row> rows{
        {"1?HREG?400010?unsignedShort", 1, "HREG", 2, 9, 1},
        {"1?HREG?400010?float", 1, "HREG", 2, 9, 2},
        {"2?IREG?300001?double", 2, "IREG", 2, 0, 4},
        {"1?HREG?400010?byte", 1, "HREG", 2, 9, 1},
        {"1?HREG?400010?string-5", 1, "HREG", 2, 9, 3},
        {"1?HREG?400010?short-200", 1, "HREG", 2, 9, 200},
        {"1?HREG?400010.3?boolean", 1, "HREG", 2, 9, 1},
        {"1?HREG?400010.12?boolean-8", 1, "HREG", 2, 9, 2},
        {"1?HREG?400010.20?boolean", 1, "HREG", 2, 9, 2},
        {"1?OUTP?21?boolean", 1, "OUTP", 0, 20, 1},
        {"1?OUTP?21?boolean-9", 1, "OUTP", 0, 20, 9},
        {"1?INP?100001?boolean", 1, "INP", 0, 0, 1},
        {"3?LONG?5?unsignedInt", 3, "LONG", 4, 5, 1},
        {"3?LONG?5?float-3", 3, "LONG", 4, 5, 3},
    };
    for (const Row& row : rows) {
        const TagPlace found = place(row.uri);
        EXPECT_EQ(row.node, found.node) << row.uri;
        EXPECT_EQ(row.area, found.area) << row.uri;
        EXPECT_EQ(row.itemBytes, found.itemBytes) << row.uri;
        EXPECT_EQ(row.itemBytes == 0, found.bits) << row.uri;
        EXPECT_EQ(row.first, found.first) << row.uri;
        EXPECT_EQ(row.items, found.items) << row.uri;
    }
}

TEST_F(TagPlacingTest, ARequestCarriesWhatDescriptionAndConfigurationAllow) {
    EXPECT_EQ(125, limits("1?HREG?400001?short").mostItems);
    EXPECT_EQ(2000, limits("1?OUTP?1?boolean").mostItems);
    EXPECT_EQ(10, limits("2?HREG?400001?short").mostItems);
    EXPECT_EQ(100, limits("2?OUTP?1?boolean").mostItems);
    EXPECT_EQ(62, limits("3?LONG?5?unsignedInt").mostItems);
}

TEST_F(TagPlacingTest, ALimitOfLessThanAnItemIsOneItem) {
    EXPECT_EQ(1, limits("4?HREG?400001?short").mostItems);
}

TEST_F(TagPlacingTest, AnAreaEndsWhereTheNodesModelSays) {
    EXPECT_EQ(65536, limits("1?HREG?400001?short").endItem);
    EXPECT_TRUE(limits("1?HREG?400001?short").onLine);
}

TEST_F(TagPlacingTest, TheDriversOwnAreasSendNothing) {
    EXPECT_FALSE(limits("3?SP_Baud?0?unsignedInt").onLine);
}

}  // namespace
}  // namespace poll
