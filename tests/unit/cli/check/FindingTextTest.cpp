#include "cli/check/FindingText.h"

#include <gtest/gtest.h>

#include "values/JsonValues.h"

namespace cli {
namespace {

using lint::Finding;
using lint::Findings;
using lint::Severity;

Finding finding(Severity severity, const char* source, int line, int column) {
    return {severity, "rule", {source, line, column}, "message", "advice"};
}

TEST(FindingTextTest, TextNamesPlaceSeverityAndRule) {
    EXPECT_EQ("a.cfg:2:5: warning: message [rule]\n    advice\n",
              findingsText({finding(Severity::Warning, "a.cfg", 2, 5)}));
    Finding without = finding(Severity::Error, "a.cfg", 1, 1);
    without.suggestion.clear();
    EXPECT_EQ("a.cfg:1:1: error: message [rule]\n", findingsText({without}));
    EXPECT_EQ("", findingsText({}));
}

TEST(FindingTextTest, JsonHasEveryMember) {
    EXPECT_EQ(R"([{"severity":"error","rule":"rule","source":"a","line":2,"column":5,)"
              R"("message":"message","suggestion":"advice"}])",
              findingsJson({finding(Severity::Error, "a", 2, 5)}).dump());
    EXPECT_EQ("[]", findingsJson({}).dump());
}

TEST(FindingTextTest, VerdictFollowsErrorsAndStrictness) {
    const Findings warning{finding(Severity::Warning, "a", 1, 1)};
    const Findings error{finding(Severity::Warning, "a", 1, 1),
                         finding(Severity::Error, "a", 1, 1)};
    struct Case {
        const Findings& findings;
        bool strict;
        int code;
    };
    const Findings none;
    const Case cases[] = {{none, false, 0},   {none, true, 0},   {warning, false, 0},
                          {warning, true, 1}, {error, false, 2}, {error, true, 2}};
    for (const Case& each : cases) {
        EXPECT_EQ(each.code, static_cast<int>(verdictOf(each.findings, each.strict)))
            << each.findings.size() << " findings, strict " << each.strict;
    }
}

}  // namespace
}  // namespace cli
