// Scaled values: shown, as numbers, and back.
#include "poll/Scaling.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "values/JsonValues.h"
#include "values/ValueError.h"
#include "values/Values.h"

namespace poll {
namespace {

using values::Bytes;
using values::ValueShape;

constexpr ValueShape kShort{ICU_Type::short_, 2};
constexpr ValueShape kWord{ICU_Type::unsignedShort, 2};
constexpr ValueShape kFloat{ICU_Type::float_, 4};
constexpr ValueShape kDouble{ICU_Type::double_, 8};
constexpr ValueShape kLong{ICU_Type::uint64, 8};
constexpr ValueShape kThree{ICU_Type::shortArray, 6};

Scaling scaling(std::optional<double> scale, std::optional<double> offset = {},
                std::optional<int> decimals = {}) {
    ListedTag tag{.name = "a", .uri = "u"};
    tag.scale = scale;
    tag.offset = offset;
    tag.decimals = decimals;
    return Scaling(tag);
}

Scaling limited(double low, double high, std::optional<double> scale = {}) {
    ListedTag tag{.name = "a", .uri = "u"};
    tag.scale = scale;
    tag.low = low;
    tag.high = high;
    return Scaling(tag);
}

std::string shown(const Scaling& how, ValueShape shape, std::string_view raw) {
    return how.textOf(shape, values::parseValue(shape, raw));
}

std::string written(const Scaling& how, ValueShape shape, std::string_view text) {
    return values::formatValue(shape, how.rawOf(shape, text));
}

std::string refusal(const Scaling& how, ValueShape shape, std::string_view text) {
    try {
        return "taken: " + values::formatValue(shape, how.rawOf(shape, text));
    } catch (const values::ValueError& error) {
        return error.what();
    }
}

TEST(ScalingTest, ValueIsRawTimesScalePlusOffset) {
    EXPECT_EQ("60", shown(scaling(0.1, -40), kShort, "1000"));
    EXPECT_EQ("-40.5", shown(scaling(0.1, -40), kShort, "-5"));
    EXPECT_EQ("0.3", shown(scaling(0.1), kShort, "3"));  // 0.1 * 3 is 0.30000000000000004.
    EXPECT_EQ("0.33", shown(scaling(0.1), kFloat, "3.3"));
    EXPECT_EQ("65535000", shown(scaling(1000), kWord, "65535"));
}

TEST(ScalingTest, DecimalsRoundAndFill) {
    EXPECT_EQ("12.35", shown(scaling(0.001, {}, 2), kShort, "12346"));
    EXPECT_EQ("12.00", shown(scaling({}, {}, 2), kShort, "12"));
    EXPECT_EQ("3", shown(scaling({}, {}, 0), kFloat, "3.3"));
    EXPECT_EQ("0.0", shown(scaling({}, {}, 1), kFloat, "-0.04"));
    EXPECT_EQ("-0.1", shown(scaling({}, {}, 1), kFloat, "-0.06"));
}

TEST(ScalingTest, WithoutAnythingValuesAreShownAsTheyCome) {
    EXPECT_TRUE(Scaling().isPlain());
    EXPECT_FALSE(scaling({}, {}, 1).isPlain());
    EXPECT_EQ("0.1", shown(Scaling(), kFloat, "0.1"));
    EXPECT_EQ("18446744073709551615", shown(Scaling(), kLong, "18446744073709551615"));
    EXPECT_EQ("18446744073709551615.0", shown(scaling(1, 0, 1), kLong, "18446744073709551615"));
}

TEST(ScalingTest, ArraysItemByItem) {
    EXPECT_EQ("0.1,-0.2,0.3", shown(scaling(0.1), kThree, "1,-2,3"));
    EXPECT_EQ("1,-2,3", written(scaling(0.1), kThree, "0.1, -0.2,0.3"));
    EXPECT_EQ("short-3 needs 3 items, not 2", refusal(scaling(0.1), kThree, "1,2"));
}

TEST(ScalingTest, WhatIsNoNumberHasNoScale) {
    EXPECT_EQ("1", shown(scaling(10), {ICU_Type::boolean, 1}, "1"));
    EXPECT_EQ("\"ab\"", shown(scaling(10), {ICU_Type::string, 4}, "ab"));
    EXPECT_EQ("1", written(scaling(10), {ICU_Type::boolean, 1}, "true"));
    EXPECT_TRUE(scaling(10).numbersOf({ICU_Type::boolean, 1}, Bytes{1}).empty());
}

TEST(ScalingTest, InfiniteAndMissingNumbersKeepTheirNames) {
    EXPECT_EQ("inf", shown(scaling(2, 0, 1), kFloat, "inf"));
    EXPECT_EQ("-inf", shown(scaling(-2), kFloat, "inf"));
    EXPECT_EQ("nan", shown(scaling(2), kDouble, "nan"));
    EXPECT_EQ("\"inf\"", scaling(2).jsonOf(kFloat, values::parseValue(kFloat, "inf")).dump());
}

TEST(ScalingTest, JsonHasNumbersAsShown) {
    EXPECT_EQ("12.35",
              scaling(0.001, {}, 2).jsonOf(kShort, values::parseValue(kShort, "12346")).dump());
    EXPECT_EQ("[0.1,-0.2,0.3]",
              scaling(0.1).jsonOf(kThree, values::parseValue(kThree, "1,-2,3")).dump());
    EXPECT_EQ("7", Scaling().jsonOf(kShort, values::parseValue(kShort, "7")).dump());
    EXPECT_EQ("true", scaling(3).jsonOf({ICU_Type::boolean, 1}, Bytes{1}).dump());
}

TEST(ScalingTest, NumbersAreNotRounded) {
    EXPECT_EQ((std::vector<double>{0.5, -1, 1.5}),
              scaling(0.5, {}, 0).numbersOf(kThree, values::parseValue(kThree, "1,-2,3")));
}

TEST(ScalingTest, TheWayBackRoundsToTheNearestStep) {
    EXPECT_EQ("33", written(scaling(0.1), kShort, "3.3"));
    EXPECT_EQ("1005", written(scaling(0.1, -40), kShort, "60.46"));
    EXPECT_EQ("-7", written(scaling(-0.5), kShort, "3.5"));
    EXPECT_EQ("33", written(scaling(0.1), kFloat, "3.3"));
    EXPECT_EQ("12", written(scaling({}, {}, 2), kShort, "12.00"));
    EXPECT_EQ("18446744073709551615", written(scaling({}, {}, 2), kLong, "18446744073709551615"));
}

TEST(ScalingTest, EveryShortComesBackFromWhatWasShown) {
    const Scaling how = scaling(0.1, -273.15, 2);
    for (int raw = -32768; raw <= 32767; ++raw) {
        const std::string text = std::to_string(raw);
        ASSERT_EQ(text, written(how, kShort, shown(how, kShort, text)));
    }
}

TEST(ScalingTest, RawValuesOutOfTheTypesRangeAreRefused) {
    EXPECT_EQ("3276.7", shown(scaling(0.1), kShort, written(scaling(0.1), kShort, "3276.74")));
    EXPECT_EQ("'3276.75' as the device has it: '32768' is out of range for short (-32768..32767)",
              refusal(scaling(0.1), kShort, "3276.75"));
    EXPECT_EQ("'-1' as the device has it: '-10' is out of range for unsignedShort (0..65535)",
              refusal(scaling(0.1), kWord, "-1"));
    EXPECT_EQ("'1e39' as the device has it: '2e+39' is out of range for float",
              refusal(scaling(0.5), kFloat, "1e39"));
    EXPECT_EQ("'inf' as the device has it: 'inf' is no whole number (short)",
              refusal(scaling(0.1), kShort, "inf"));
    EXPECT_EQ("'x' is no number for double", refusal(scaling(0.1), kShort, "x"));
}

TEST(ScalingTest, LimitsHoldForWhatIsWritten) {
    EXPECT_EQ("100", written(limited(0, 10, 0.1), kShort, "10"));
    EXPECT_EQ("'10.1' is above the tag's high limit 10",
              refusal(limited(0, 10, 0.1), kShort, "10.1"));
    EXPECT_EQ("'-1' is below the tag's low limit 0", refusal(limited(0, 10), kShort, "-1"));
    EXPECT_EQ("'nan' is below the tag's low limit 0", refusal(limited(0, 10), kFloat, "nan"));
    EXPECT_EQ("'30' is above the tag's high limit 10", refusal(limited(0, 10), kThree, "1,2,30"));
}

}  // namespace
}  // namespace poll
