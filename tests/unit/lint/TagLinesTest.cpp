#include "lint/TagLines.h"

#include <gtest/gtest.h>

namespace lint {
namespace {

TEST(TagLinesTest, FieldsAreTrimmedAndKnowTheirColumns) {
    const TagLine tag = tagLine("1? HREG ?400001.3? int (swap2)", "t", 1, 5);
    ASSERT_TRUE(tag.wellFormed());
    EXPECT_EQ("HREG", tag.area());
    EXPECT_EQ(8, tag.placeOf(1).column);
    EXPECT_EQ("400001", tag.address());
    EXPECT_EQ("3", tag.subIndex());
    EXPECT_EQ("int (swap2)", tag.dataType());
    EXPECT_EQ(tag.place, tag.placeOf(9));
}

TEST(TagLinesTest, AByteOrderByNameIsItsConversions) {
    const TagLine tag = tagLine("1?HREG?400001?float@ABCD", "t", 1, 1);
    EXPECT_EQ("1?HREG?400001?float@ABCD", tag.uri);
    EXPECT_EQ("1?HREG?400001?float(swap2,swap4)", tag.driverUri);
    EXPECT_EQ("float(swap2,swap4)", tag.dataType());
    EXPECT_EQ("", tag.orderRefusal);
    const TagLine wrong = tagLine("1?HREG?400001?float@ABDC", "t", 1, 1);
    EXPECT_EQ("'ABDC' is no byte order of float: ABCD, CDAB, DCBA, BADC", wrong.orderRefusal);
    EXPECT_EQ(wrong.driverUri, wrong.uri);
}

TEST(TagLinesTest, OtherCountsOfFieldsAreNotWellFormed) {
    for (const char* uri : {"", "1", "1?A?2", "1?A?2?int?x"}) {
        EXPECT_FALSE(tagLine(uri, "t", 1, 1).wellFormed()) << uri;
    }
}

TEST(TagLinesTest, DataTypesComeApart) {
    const DataTypeText array = dataTypeText("float-4(swap2, swap4)");
    EXPECT_EQ("float-", array.name);
    EXPECT_EQ((std::vector<std::string>{"swap2", "swap4"}), array.conversions);
    EXPECT_EQ("short", dataTypeText(" short ").name);
    EXPECT_TRUE(dataTypeText("short").conversions.empty());
    EXPECT_EQ((std::vector<std::string>{""}), dataTypeText("short()").conversions);
}

}  // namespace
}  // namespace lint
