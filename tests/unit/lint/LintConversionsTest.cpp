// Conversions, and what came of them when the driver tried.
#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

Findings lint(const std::string& area, ICU_Type type, int length, const std::string& dataType,
              std::vector<ConversionFacts> tried) {
    TagLine tag = acceptedTag("1?" + area + "?400001?" + dataType, 1, 0, 0, type, length);
    tag.facts->conversions = std::move(tried);
    Findings out;
    lintConversions(tag, surroundingsOf("CfgVer=1", sampleDescription()), out);
    return out;
}

Findings lintShort(const std::string& dataType, std::vector<ConversionFacts> tried) {
    return lint("HREG", ICU_Type::short_, 2, dataType, std::move(tried));
}

TEST(LintConversionsTest, WhatWorksIsNotMentioned) {
    EXPECT_EQ("", placesOf(lintShort("short", {})));
    EXPECT_EQ("", placesOf(lintShort("short(swap2)", {{"swap2", true, true, 1, 0}})));
    EXPECT_EQ("", placesOf(lintShort("short(neg)", {{"neg", true, true, 1, 1}})));
}

TEST(LintConversionsTest, WhatFailsBothWaysIsAnError) {
    const Findings findings = lintShort("short(swap4)", {{"swap4", false, false, 1, 0}});
    ASSERT_EQ("impossible-conversion@1:15", placesOf(findings)) << "and nothing more";
    EXPECT_EQ(Severity::Error, findings[0].severity);
    EXPECT_EQ("conversion 'swap4' can't be applied to short: every access will fail",
              findings[0].message);
}

TEST(LintConversionsTest, WhatFailsOneWayIsAWarningWhereThatWayExists) {
    const std::vector<ConversionFacts> tried{{"bcd", true, false, 1, 1}};
    const Findings findings = lint("HREG", ICU_Type::double_, 8, "double(bcd)", tried);
    ASSERT_EQ("impossible-conversion@1:15", placesOf(findings));
    EXPECT_EQ(Severity::Warning, findings[0].severity);
    EXPECT_EQ("conversion 'bcd' can't be applied to double: every write will fail",
              findings[0].message);
    EXPECT_EQ("unsuitable-conversion@1:15",
              placesOf(lint("IREG", ICU_Type::double_, 8, "double(bcd)", tried)));
    const Findings unreadable =
        lint("IREG", ICU_Type::double_, 8, "double(bcd)", {{"bcd", false, true, 1, 1}});
    EXPECT_EQ(Severity::Error, unreadable[0].severity) << "nothing else can be done with it";
}

TEST(LintConversionsTest, WhatReachesOnlySomeItemsIsAWarning) {
    const Findings findings =
        lint("HREG", ICU_Type::shortArray, 20, "short-10(neg)", {{"neg", true, true, 10, 5}});
    ASSERT_EQ("partial-conversion@1:15", placesOf(findings));
    EXPECT_EQ("conversion 'neg' reaches only the first 5 of 10 items", findings[0].message);
}

TEST(LintConversionsTest, EachOfSeveralIsLookedAt) {
    EXPECT_EQ("unknown-conversion@1:15 impossible-conversion@1:15",
              placesOf(lintShort("short(swp2,swap4)",
                                 {{"swp2", false, false, 1, 0}, {"swap4", false, false, 1, 0}})));
}

}  // namespace
}  // namespace lint
