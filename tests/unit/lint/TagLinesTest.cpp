#include "lint/TagLines.h"

#include <gtest/gtest.h>

namespace lint {
namespace {

using settings::Place;

TEST(TagLines, CommentsAndBlanksDoNotCount) {
    const auto tags = tagLines("t", "# all\n\n  1?A?2?int  # one\r\n\t#\n1?B?3?int");
    ASSERT_EQ(tags.size(), 2U);
    EXPECT_EQ(tags[0].uri, "1?A?2?int");
    EXPECT_EQ(tags[0].place, (Place{"t", 3, 3}));
    EXPECT_EQ(tags[1].place, (Place{"t", 5, 1}));
}

TEST(TagLines, LinesMayEndInCarriageReturns) {
    const auto tags = tagLines("t", "1?A?2?int\r\n1?A?3?int\r\n");
    ASSERT_EQ(tags.size(), 2U);
    EXPECT_EQ(tags[0].uri, "1?A?2?int");
    EXPECT_EQ(tags[1].dataType(), "int");
}

TEST(TagLines, FieldsAreTrimmedAndKnowTheirColumns) {
    const TagLine tag = tagLine("1? HREG ?400001.3? int (swap2)", "t", 1, 5);
    ASSERT_TRUE(tag.wellFormed());
    EXPECT_EQ(tag.area(), "HREG");
    EXPECT_EQ(tag.placeOf(1).column, 8);
    EXPECT_EQ(tag.address(), "400001");
    EXPECT_EQ(tag.subIndex(), "3");
    EXPECT_EQ(tag.dataType(), "int (swap2)");
    EXPECT_EQ(tag.placeOf(9), tag.place);
}

TEST(TagLines, AByteOrderByNameIsItsConversions) {
    const TagLine tag = tagLine("1?HREG?400001?float@ABCD", "t", 1, 1);
    EXPECT_EQ("1?HREG?400001?float@ABCD", tag.uri);
    EXPECT_EQ("1?HREG?400001?float(swap2,swap4)", tag.driverUri);
    EXPECT_EQ("float(swap2,swap4)", tag.dataType());
    EXPECT_EQ("", tag.orderRefusal);
    const TagLine wrong = tagLine("1?HREG?400001?float@ABDC", "t", 1, 1);
    EXPECT_EQ("'ABDC' is no byte order of float: ABCD, CDAB, DCBA, BADC", wrong.orderRefusal);
    EXPECT_EQ(wrong.uri, wrong.driverUri);
}

TEST(TagLines, OtherCountsOfFieldsAreNotWellFormed) {
    for (const char* uri : {"", "1", "1?A?2", "1?A?2?int?x"}) {
        EXPECT_FALSE(tagLine(uri, "t", 1, 1).wellFormed()) << uri;
    }
}

TEST(TagLines, DataTypesComeApart) {
    const DataTypeText array = dataTypeText("float-4(swap2, swap4)");
    EXPECT_EQ(array.name, "float-");
    EXPECT_EQ(array.conversions, (std::vector<std::string>{"swap2", "swap4"}));
    EXPECT_EQ(dataTypeText(" short ").name, "short");
    EXPECT_TRUE(dataTypeText("short").conversions.empty());
    EXPECT_EQ(dataTypeText("short()").conversions, (std::vector<std::string>{""}));
}

}  // namespace
}  // namespace lint
