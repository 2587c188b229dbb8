// Tags as people read them.
#include "cli/poll/ShownTags.h"

#include <gtest/gtest.h>

#include <cmath>

#include "tests/unit/cli/poll/PollSamples.h"
#include "values/JsonValues.h"

namespace {

using cli::ShownTags;
using cli::ValueHistory;
using cli_test::noon;
using values::Json;

TEST(ShownTagsTest, ScalesValues) {
    const ShownTags tags = cli_test::sampleTags();
    const std::vector<std::uint8_t> raw{0x39, 0x05};
    EXPECT_EQ("133.7", tags.valueText(0, raw));
    EXPECT_EQ(Json(133.7), tags.jsonValue(0, raw));
    EXPECT_DOUBLE_EQ(133.7, tags.number(0, raw));
}

TEST(ShownTagsTest, KeepsArraysAsArrays) {
    poll::ListedTag one{.name = "one", .uri = "1?HREG?400001?unsignedShort-1"};
    one.scale = 2;
    const ShownTags tags({one}, {{ICU_Type::unsignedShortArray, 2}});
    EXPECT_EQ(Json::array({6}), tags.jsonValue(0, std::vector<std::uint8_t>{3, 0}));
}

TEST(ShownTagsTest, WritesInfiniteScaledValuesAsTexts) {
    poll::ListedTag real{.name = "real", .uri = "1?HREG?400001?float"};
    real.scale = 2;
    const ShownTags tags({real}, {{ICU_Type::float_, 4}});
    EXPECT_EQ(Json("inf"), tags.jsonValue(0, std::vector<std::uint8_t>{0, 0, 0x80, 0x7F}));
}

TEST(ShownTagsTest, HasNumbersForBooleansAndNoneForTexts) {
    const ShownTags tags = cli_test::sampleTags();
    EXPECT_EQ(1.0, tags.number(1, std::vector<std::uint8_t>{1}));
    EXPECT_TRUE(std::isnan(tags.number(2, std::vector<std::uint8_t>{'1', 0, 0, 0})));
}

TEST(ShownTagsTest, KeepsTheLastValues) {
    const ShownTags tags = cli_test::sampleTags();
    poll::Snapshot snapshot = cli_test::sampleSnapshot();
    ValueHistory history;
    EXPECT_TRUE(history.of(0).empty());
    for (std::uint8_t i = 1; i <= 20; ++i) {
        snapshot.tags[0] = cli_test::goodState({static_cast<std::uint8_t>(i * 10), 0}, i);
        history.note(tags, snapshot);
        history.note(tags, snapshot);  // Nothing was read in between.
    }
    const auto values = history.of(0);
    ASSERT_EQ(ValueHistory::kLength, values.size());
    EXPECT_DOUBLE_EQ(9, values.front());
    EXPECT_DOUBLE_EQ(20, values.back());
    EXPECT_TRUE(history.of(2).empty()) << "it never had a value";
}

TEST(ShownTagsTest, MakesRows) {
    const ShownTags tags = cli_test::sampleTags();
    const poll::Snapshot snapshot = cli_test::sampleSnapshot();
    const ValueHistory history;
    const cli::ShownRows rows(tags, snapshot, history, noon());
    const cli::TableRow level = rows.row(0);
    EXPECT_EQ("133.7", level.value);
    EXPECT_EQ(std::chrono::milliseconds(1750), level.age);
    const cli::TableRow text = rows.row(2);
    EXPECT_EQ("", text.value);
    EXPECT_EQ("exception 2, \"illegal\"", text.error);
    EXPECT_FALSE(text.age);
}

TEST(ShownTagsTest, CountsQualities) {
    const cli::TableContent content = cli::contentOf(cli_test::sampleSnapshot(), "told");
    EXPECT_EQ(2U, content.counts.good);
    EXPECT_EQ(1U, content.counts.bad);
    EXPECT_EQ(0U, content.counts.stale + content.counts.never);
    EXPECT_EQ("told", content.notice);
}

TEST(ShownTagsTest, LooksForNamesAndUris) {
    const auto texts = cli_test::sampleTags().searchTexts();
    EXPECT_EQ("Level 1?HREG?400001?unsignedShort", texts[0]);
}

}  // namespace
