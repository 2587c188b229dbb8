#include "cli/describe/TextTable.h"

#include <gtest/gtest.h>

namespace cli {
namespace {

TEST(TextTable, ColumnsAreAsWideAsTheirLongestText) {
    EXPECT_EQ(textTable({{"A", "B"}, {"long", "x"}}), "A     B\nlong  x\n");
}

TEST(TextTable, LastColumnGoesOnBelowItself) {
    EXPECT_EQ(textTable({{"k", "one, two, three"}}, 12), "k  one, two,\n   three\n");
}

TEST(TextTable, WordsLongerThanTheSpaceAreNotCut) {
    EXPECT_EQ(textTable({{"key", "abcdefghij kl"}}, 8), "key  abcdefghij\n     kl\n");
}

TEST(TextTable, EmptyLastTextsLeaveNoBlanksAtTheEnd) {
    EXPECT_EQ(textTable({{"a", "b", ""}, {"c", "", ""}}), "a  b\nc\n");
}

TEST(TextTable, NothingIsNothing) {
    EXPECT_EQ(textTable({}), "");
}

}  // namespace
}  // namespace cli
