#include "lint/Finding.h"

#include <gtest/gtest.h>

#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

Finding finding(Severity severity, const char* source, int line, int column) {
    return {severity, "rule", {source, line, column}, "message", "advice"};
}

TEST(FindingTest, OrderIsThatOfSourcesLinesAndColumns) {
    Findings findings{finding(Severity::Warning, "z", 2, 1), finding(Severity::Warning, "a", 1, 1),
                      finding(Severity::Error, "z", 1, 9), finding(Severity::Error, "z", 1, 2)};
    sortByPlace(findings);
    EXPECT_EQ("rule@1:2 rule@1:9 rule@2:1 rule@1:1", placesOf(findings));
    EXPECT_EQ("a", findings.back().place.source);
}

}  // namespace
}  // namespace lint
