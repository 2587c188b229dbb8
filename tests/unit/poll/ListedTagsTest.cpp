// Lists of tags as they are meant.
#include "poll/TagList.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;

TagList goodList(std::string_view text) {
    TagList list = parseTagList(text, "tags.csv");
    for (const ListComplaint& each : list.complaints)
        ADD_FAILURE() << each.line << ":" << each.column << ": " << each.text;
    return list;
}

std::vector<std::string> urisOf(const TagList& list) {
    std::vector<std::string> uris;
    for (const ListedTag& tag : list.tags)
        uris.push_back(tag.uri);
    return uris;
}

TEST(ListedTagsTest, EveryColumnInAnyOrder) {
    const TagList list = goodList(
        "comment,high,low,decimals,unit,offset,scale,period,uri,name\n"
        "boiler,120,-20.5,1,°C,-40,0.1,500,1?HREG?400001?short,flow\n");
    ASSERT_EQ(1U, list.tags.size());
    const ListedTag& tag = list.tags[0];
    EXPECT_EQ("flow", tag.name);
    EXPECT_EQ("1?HREG?400001?short", tag.uri);
    EXPECT_EQ(milliseconds(500), tag.period);
    EXPECT_EQ(0.1, tag.scale);
    EXPECT_EQ(-40, tag.offset);
    EXPECT_EQ("°C", tag.unit);
    EXPECT_EQ(1, tag.decimals);
    EXPECT_EQ(-20.5, tag.low);
    EXPECT_EQ(120, tag.high);
    EXPECT_EQ("boiler", tag.comment);
    EXPECT_EQ(2, tag.line);
}

TEST(ListedTagsTest, CellsKnowTheirColumns) {
    const TagList list = goodList("name, uri ,period,scale\nflow, 1?A?2?int , 5,\"2\"\n");
    ASSERT_EQ(1U, list.tags.size());
    EXPECT_EQ(1, list.tags[0].columns.name);
    EXPECT_EQ(7, list.tags[0].columns.uri);
    EXPECT_EQ(19, list.tags[0].columns.period);
    EXPECT_EQ(21, list.tags[0].columns.scale);
}

TEST(ListedTagsTest, EmptyCellsAreNotGiven) {
    const TagList list =
        goodList("name,uri,period,scale,offset,unit,decimals,low,high\na,u?,,,, ,\"\",,\n");
    ASSERT_EQ(1U, list.tags.size());
    const ListedTag& tag = list.tags[0];
    EXPECT_FALSE(tag.period || tag.scale || tag.offset || tag.decimals || tag.low || tag.high);
    EXPECT_EQ("", tag.unit);
}

TEST(ListedTagsTest, ColumnNamesInCapitals) {
    EXPECT_EQ(1U, goodList("Name,URI\na,1?A?2?int\n").tags.size());
}

TEST(ListedTagsTest, QuotedFieldsHoldCommasQuotesAndLineEnds) {
    const TagList list = goodList(
        "name,uri,comment\n"
        "a,\"1?A?2?float(swap2,swap4)\",\"a \"\"hot\"\" one,\r\nin two lines\"\n"
        " \"b, c\" ,u,\"\"\n");
    ASSERT_EQ(2U, list.tags.size());
    EXPECT_EQ("1?A?2?float(swap2,swap4)", list.tags[0].uri);
    EXPECT_EQ("a \"hot\" one,\r\nin two lines", list.tags[0].comment);
    EXPECT_EQ("b, c", list.tags[1].name);
    EXPECT_EQ(4, list.tags[1].line);
    EXPECT_EQ(2, list.tags[1].columns.name);
}

TEST(ListedTagsTest, ByteOrderMarksCarriageReturnsAndAMissingLastLineEnd) {
    for (const char* text : {"name,uri\na,u\nb,v\n", "\xEF\xBB\xBFname,uri\r\na,u\r\nb,v\r\n",
                             "name,uri\r\na,u\r\nb,v", "name,uri\na,u\nb,v\r"}) {
        const TagList list = goodList(text);
        EXPECT_EQ((std::vector<std::string>{"u", "v"}), urisOf(list)) << text;
    }
}

TEST(ListedTagsTest, CommentsAndEmptyLinesOfCsv) {
    const TagList list = goodList("# pumps\n\nname,uri\n  \n# old: x,y,z\na,u#1\n");
    ASSERT_EQ(1U, list.tags.size());
    EXPECT_EQ("u#1", list.tags[0].uri);
    EXPECT_EQ(6, list.tags[0].line);
}

TEST(ListedTagsTest, PeriodsWithAndWithoutUnits) {
    const TagList list =
        goodList("name,uri,period\na,u,1\nb,u,500ms\nc,u,2s\nd,u,0.5 s\ne,u,86400000\nf,u,1e3\n");
    std::vector<long long> periods;
    for (const ListedTag& tag : list.tags)
        periods.push_back(tag.period.value_or(milliseconds(-1)).count());
    EXPECT_EQ((std::vector<long long>{1, 500, 2000, 500, 86400000, 1000}), periods);
}

TEST(ListedTagsTest, NumbersWithSignsAndExponents) {
    const TagList list = goodList("name,uri,scale,offset,low\na,u,+0.1,-1e-3,.5\n");
    ASSERT_EQ(1U, list.tags.size());
    EXPECT_EQ(0.1, list.tags[0].scale);
    EXPECT_EQ(-0.001, list.tags[0].offset);
    EXPECT_EQ(0.5, list.tags[0].low);
}

TEST(ListedTagsTest, APlainListNamesTagsByTheirUris) {
    const TagList list =
        goodList("\xEF\xBB\xBF# all\n\n  1?A?2?float(swap2,swap4)  # one\r\n\t#\n1?B?3?int");
    ASSERT_EQ(2U, list.tags.size());
    EXPECT_EQ("1?A?2?float(swap2,swap4)", list.tags[0].uri);
    EXPECT_EQ(list.tags[0].uri, list.tags[0].name);
    EXPECT_EQ(3, list.tags[0].line);
    EXPECT_EQ(3, list.tags[0].columns.uri);
    EXPECT_EQ(5, list.tags[1].line);
    EXPECT_EQ(1, list.tags[1].columns.uri);
}

TEST(ListedTagsTest, APlainListMayRepeatAUriAndHoldAnyBytesInComments) {
    EXPECT_EQ(2U, goodList("1?A?2?int # \xE4\n1?A?2?int\nno uri\n").tags.size() - 1);
}

TEST(ListedTagsTest, AHundredThousandTags) {
    std::string text = "name,uri,period\n";
    for (int i = 0; i < 100000; ++i) {
        const std::string number = std::to_string(i);
        text += "tag" + number + ",1?HREG?" + number + "?short,500\n";
    }
    const TagList list = goodList(text);
    ASSERT_EQ(100000U, list.tags.size());
    EXPECT_EQ("tag99999", list.tags.back().name);
    EXPECT_EQ(100001, list.tags.back().line);
}

}  // namespace
}  // namespace poll
