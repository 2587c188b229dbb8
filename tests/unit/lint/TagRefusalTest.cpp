// The field that is to blame for a refusal, and what may stand there.
#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

TEST(TagRefusalTest, PointsAtTheFieldWithASuggestion) {
    struct Case {
        const char* uri;
        int column;
        const char* suggestion;
    };
    const Case cases[] = {
        {"1?HREG?400001", 1, "write nodeid?memorytype?arrayindex.subindex?datatype"},
        {"1??400001?int", 3, "fill in the memorytype"},
        {"1?HREGS?400001?int", 3, "did you mean 'HREG'?"},
        {"1?weather?1?int", 3, "model 1 offers OUTP, HREG, IREG"},
        {"1?LONG?5?int", 3, "model 1 offers OUTP, HREG, IREG"},
        {"1?HREG?400001?unsignedShrt", 15, "did you mean 'unsignedShort'?"},
        {"1?HREG?400001?word", 15, "'mrtu describe memory' lists the data types"},
        {"1?HREG?1?int", 8, "model 1 has HREG 400001..465536"},
        {"2?LONG?65536?int", 8, "model 3 has LONG 0..65535"},
        {"1?OUTP?1?short", 10, "OUTP takes boolean, boolean-"},
        {"1?HREG?400001?time", 15, "HREG takes all but time, time-, object"},
    };
    const TagSurroundings around =
        surroundingsOf("CfgVer=1 defNodeId=1 Node2::model=3", sampleDescription());
    for (const Case& each : cases) {
        const Finding finding = tagRefusal(tagLine(each.uri, "t", 1, 1), around, "no");
        EXPECT_EQ(Severity::Error, finding.severity) << each.uri;
        EXPECT_EQ("no", finding.message) << each.uri;
        EXPECT_EQ(each.column, finding.place.column) << each.uri;
        EXPECT_EQ(each.suggestion, finding.suggestion) << each.uri;
    }
}

}  // namespace
}  // namespace lint
