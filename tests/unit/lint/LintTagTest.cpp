// Single tags and what is found in them.
#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

const std::string kConfig = "CfgVer=1 defNodeId=1 Node2::model=3 Node3::timeout=1";

TagSurroundings around() {
    return surroundingsOf(kConfig, sampleDescription());
}

/// A tag of two bytes, or one bit where the data type says so; its offset does not matter here.
std::string lint(const std::string& uri) {
    const bool bit = uri.find("boolean") != std::string::npos;
    return placesOf(
        lintTag(acceptedTag(uri, 1, 0, 0, bit ? ICU_Type::boolean : ICU_Type::short_, bit ? 1 : 2),
                around()));
}

TEST(LintTagTest, FindsWhatTheDriverPassesOver) {
    struct Case {
        const char* uri;
        const char* places;
    };
    const Case cases[] = {
        {"1?HREG?400001?short", ""},
        {"3?HREG?400001?short", ""},
        {"0x2?HREG?400001?short", ""},
        {"7?HREG?400001?short", "unnamed-node@1:1"},
        {"01?HREG?400001?short", "octal-number@1:1"},
        {"one?HREG?400001?short", "unnamed-node@1:1 not-a-number@1:1 unusable-node@1:1"},
        {"1?OUTP?017?boolean", "octal-number@1:8"},
        {"1?OUTP?0?boolean", ""},
        {"1?OUTP?0x10?boolean", ""},
        {"1?HREG?400001x?short", "not-a-number@1:8"},
        {"1?HREG?400001.08?boolean", "octal-number@1:8"},
        {"1?HREG?400001.?boolean", "not-a-number@1:8"},
        {"1?HREG?40001?short", "short-address@1:8"},
        {"1?IREG?39999?short", "short-address@1:8"},
        {"1?OUTP?9999?boolean", ""},
        {"1?OUTP?20000?boolean", ""},
        {"1?OUTP?40001?boolean", "foreign-address@1:8"},
        {"1?OUTP?30001?boolean", "foreign-address@1:8"},
        {"2?LONG?40001?int", ""},
        {"1?HREG?400001.3?boolean", ""},
        {"1?HREG?400001.3?short", "ignored-subindex@1:8"},
        {"1?HREG?400001.0?short", ""},
        {"1?OUTP?5.3?boolean", "ignored-subindex@1:8"},
        {"1?HREG?400001?short(swap2)", ""},
        {"1?HREG?400001?short(swp2)", "unknown-conversion@1:15"},
        {"1?HREG?400001?short(swap2,)", "unknown-conversion@1:15"},
        {"1?HREG?400001?unsignedShort(neg)", "unsuitable-conversion@1:15"},
        {"0?HREG?400001?short", "unnamed-node@1:1 unusable-node@1:1"},
        {"1?OUTP?5.-1?boolean", "negative-subindex@1:8"},
        {"1?HREG?400001.-1?boolean", "negative-subindex@1:8"},
        {"1?HREG?400001.-1?short", "ignored-subindex@1:8"},
    };
    for (const Case& each : cases)
        EXPECT_EQ(each.places, lint(each.uri)) << each.uri;
}

TEST(LintTagTest, FiveDigitAddressIsExplainedInBothForms) {
    const Findings findings =
        lintTag(acceptedTag("1?HREG?40010?short", 1, 9, 0, ICU_Type::short_, 2), around());
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ("write 400010 or 440010", findings[0].suggestion);
}

TEST(LintTagTest, SixDigitFormIsSuggestedForAnotherAreasShortForm) {
    const Findings findings =
        lintTag(acceptedTag("1?OUTP?40010?boolean", 1, 0, 0, ICU_Type::boolean, 1), around());
    ASSERT_EQ(1U, findings.size());
    EXPECT_NE(findings[0].suggestion.find("400010"), std::string::npos) << findings[0].suggestion;
}

TEST(LintTagTest, OctalAddressTellsWhatItIsReadAs) {
    const Findings findings =
        lintTag(acceptedTag("1?OUTP?0100?boolean", 1, 0, 0, ICU_Type::boolean, 1), around());
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ("address '0100' begins with a zero and is read as octal: 64", findings[0].message);
    EXPECT_EQ("write 100 for the decimal number", findings[0].suggestion);
}

TEST(LintTagTest, RefusedTagsAreLeftToTheirRefusal) {
    EXPECT_TRUE(lintTag(tagLine("7?HREG?0100?x", "t", 1, 1), around()).empty());
    EXPECT_TRUE(lintTag(tagLine("7", "t", 1, 1), around()).empty());
}

TEST(LintTagTest, ModelsFollowTheNodeAndThenTheConfiguration) {
    const TagSurroundings surroundings = surroundingsOf(
        "CfgVer=1 defNodeId=1 model=3 Node2::model=1 Node4::model=x", sampleDescription());
    EXPECT_EQ((std::set<int>{1, 2, 4}), surroundings.nodes);
    EXPECT_EQ("3", surroundings.modelOf(1)->name);
    EXPECT_EQ("1", surroundings.modelOf(2)->name);
    EXPECT_EQ("1", surroundings.modelOf(4)->name) << "an unknown model is the first one";
    EXPECT_EQ("3", surroundings.modelOf(9)->name);
}

}  // namespace
}  // namespace lint
