#include "cli/describe/TextTable.h"

#include <gtest/gtest.h>

namespace cli {
namespace {

TEST(TextTableTest, ColumnsAreAsWideAsTheirLongestText) {
    EXPECT_EQ("A     B\nlong  x\n", textTable({{"A", "B"}, {"long", "x"}}));
}

TEST(TextTableTest, LastColumnGoesOnBelowItself) {
    EXPECT_EQ("k  one, two,\n   three\n", textTable({{"k", "one, two, three"}}, 12));
}

TEST(TextTableTest, WordsLongerThanTheSpaceAreNotCut) {
    EXPECT_EQ("key  abcdefghij\n     kl\n", textTable({{"key", "abcdefghij kl"}}, 8));
}

TEST(TextTableTest, EmptyLastTextsLeaveNoBlanksAtTheEnd) {
    EXPECT_EQ("a  b\nc\n", textTable({{"a", "b", ""}, {"c", "", ""}}));
}

TEST(TextTableTest, NothingIsNothing) {
    EXPECT_EQ("", textTable({}));
}

}  // namespace
}  // namespace cli
