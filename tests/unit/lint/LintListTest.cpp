// What a list says of its tags, side by side and one by one.
#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

std::string lint(const std::vector<TagLine>& tags) {
    return placesOf(lintList(tags, sampleDescription()));
}

TagLine every(std::optional<long long> period, int line, unsigned offset, ICU_Type type, int bytes,
              int bit = 0) {
    TagLine tag = acceptedTag("1?HREG?0?x", line, offset, bit, type, bytes);
    tag.listed.period = period;
    tag.listed.periodPlace = {"t", line, 20};
    return tag;
}

TagLine word(std::optional<long long> period, int line, unsigned offset) {
    return every(period, line, offset, ICU_Type::short_, 2);
}

TEST(LintListTest, TwoPeriodsOnOneRegisterAreReportedOnceAndFurtherDown) {
    EXPECT_EQ("two-periods@2:20", lint({word(500, 1, 7), word(1000, 2, 7)}));
    EXPECT_EQ("two-periods@2:20 two-periods@3:20",
              lint({word(500, 1, 7), word(1000, 2, 7), word(2000, 3, 7)}));
    EXPECT_EQ("two-periods@2:20", lint({every(500, 1, 6, ICU_Type::float_, 4), word(1000, 2, 7)}));
}

TEST(LintListTest, BitsShareTheirRegister) {
    EXPECT_EQ("two-periods@2:20",
              lint({word(500, 1, 7), every(100, 2, 7, ICU_Type::boolean, 1, 3)}));
    EXPECT_EQ("two-periods@2:20", lint({every(500, 1, 7, ICU_Type::boolean, 1, 15),
                                        every(100, 2, 7, ICU_Type::boolean, 1, 3)}));
}

TEST(LintListTest, OnePeriodNoneAndNeighboursAreFine) {
    EXPECT_EQ("", lint({word(500, 1, 7), word(500, 2, 7)}));
    EXPECT_EQ("", lint({word(500, 1, 7), word(std::nullopt, 2, 7)}));
    EXPECT_EQ("", lint({word(500, 1, 7), word(1000, 2, 8)}));
}

TEST(LintListTest, OtherNodesAreOtherRegisters) {
    TagLine elsewhere = word(1000, 2, 7);
    elsewhere.facts->node = 2;
    EXPECT_EQ("", lint({word(500, 1, 7), elsewhere}));
}

TagLine scaled(ICU_Type type, int bytes, ICU_Type item = ICU_Type::none) {
    TagLine tag = acceptedTag("1?HREG?0?x", 1, 0, 0, type, bytes, item);
    tag.listed.scaledBy = "scale";
    tag.listed.scalePlace = {"t", 1, 30};
    return tag;
}

TEST(LintListTest, OnlyNumbersHaveAScale) {
    EXPECT_EQ("", lint({scaled(ICU_Type::short_, 2)}));
    EXPECT_EQ("", lint({scaled(ICU_Type::floatArray, 8, ICU_Type::float_)}));
    EXPECT_EQ("unused-scale@1:30", lint({scaled(ICU_Type::boolean, 1)}));
    EXPECT_EQ("unused-scale@1:30", lint({scaled(ICU_Type::booleanArray, 8, ICU_Type::boolean)}));
    EXPECT_EQ("unused-scale@1:30", lint({scaled(ICU_Type::string, 8)}));
    TagLine refused = scaled(ICU_Type::boolean, 1);
    refused.facts.reset();
    EXPECT_EQ("", lint({refused}));
}

TEST(LintListTest, TheLowLimitIsNotAboveTheHighOne) {
    TagLine tag = word(500, 1, 7);
    tag.listed.limitsPlace = {"t", 1, 40};
    tag.listed.low = 5;
    EXPECT_EQ("", lint({tag}));
    tag.listed.high = 5;
    EXPECT_EQ("", lint({tag}));
    tag.listed.high = 4.9;
    EXPECT_EQ("swapped-limits@1:40", lint({tag}));
}

}  // namespace
}  // namespace lint
