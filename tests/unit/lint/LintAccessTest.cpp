// Tags that the driver accepts although no access to them can succeed, or does what was meant.
#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

const std::string kConfig =
    "CfgVer=1 defNodeId=1 Node2::model=3 Node3::forceFunction=05 Node4::forceFunction=15";

TagSurroundings around(const std::string& config = kConfig) {
    return surroundingsOf(config, sampleDescription());
}

/// The rules of lintAccess() alone.
Findings findingsOf(const TagLine& tag, const std::string& config = kConfig) {
    Findings out;
    lintAccess(tag, around(config), out);
    return out;
}

std::string lint(const TagLine& tag) {
    return placesOf(findingsOf(tag));
}

TEST(LintAccessTest, TagWithoutLengthIsAnError) {
    struct Case {
        const char* uri;
        int length;
        const char* places;
    };
    const Case cases[] = {
        {"1?HREG?400001?string-0", 0, "empty-tag@1:15"},
        {"1?HREG?400001?int-", 0, "empty-tag@1:15"},
        {"1?HREG?400001?int--3", -12, "empty-tag@1:15"},
        {"1?HREG?400001?string-1", 1, ""},
    };
    for (const Case& each : cases) {
        EXPECT_EQ(each.places, lint(acceptedTag(each.uri, 1, 0, 0, ICU_Type::string, each.length)))
            << each.uri;
    }
    const Findings findings =
        findingsOf(acceptedTag("1?HREG?400001?string-0", 1, 0, 0, ICU_Type::string, 0));
    EXPECT_EQ(Severity::Error, findings[0].severity);
    EXPECT_EQ("write how many, e.g. string-16", findings[0].suggestion);
}

TEST(LintAccessTest, TagThatLeavesItsAreaIsAnError) {
    EXPECT_EQ("", lint(acceptedTag("1?HREG?465536?short", 1, 65535, 0, ICU_Type::short_, 2)));
    EXPECT_EQ("", lint(acceptedTag("1?HREG?465535?int", 1, 65534, 0, ICU_Type::int_, 4)));
    const TagLine beyond = acceptedTag("1?HREG?465536?int", 1, 65535, 0, ICU_Type::int_, 4);
    EXPECT_EQ("outside-area@1:8", lint(beyond));
    const Finding finding = findingsOf(beyond)[0];
    EXPECT_EQ(Severity::Error, finding.severity);
    EXPECT_EQ(
        "the tag reaches to HREG 465537, beyond the area's last address, 465536: every access will "
        "fail",
        finding.message);
}

TEST(LintAccessTest, TagThatLeavesItsAreaIsSeenInEveryKindOfArea) {
    // Coils: offset 65532 is bit 4 of byte 8191.
    const auto coils = [](int count) {
        return acceptedTag("1?OUTP?65533?boolean-" + std::to_string(count), 1, 8191, 4,
                           ICU_Type::booleanArray, count, ICU_Type::boolean);
    };
    EXPECT_EQ("", lint(coils(4)));
    EXPECT_EQ("outside-area@1:8", lint(coils(5)));
    // Bits of the last register.
    EXPECT_EQ("",
              lint(acceptedTag("1?HREG?465536.15?boolean", 1, 65535, 15, ICU_Type::boolean, 1)));
    EXPECT_EQ("outside-area@1:8",
              lint(acceptedTag("1?HREG?465536.16?boolean", 1, 65535, 16, ICU_Type::boolean, 1)));
    // 32-bit registers.
    EXPECT_EQ("", lint(acceptedTag("2?LONG?65535?int", 1, 65535, 0, ICU_Type::int_, 4)));
    EXPECT_EQ("outside-area@1:8", lint(acceptedTag("2?LONG?65535?int-2", 1, 65535, 0,
                                                   ICU_Type::intArray, 8, ICU_Type::int_)));
    // An area of the driver itself is one value.
    EXPECT_EQ("", lint(acceptedTag("1?NO?0?unsignedByte", 1, 0, 0, ICU_Type::unsignedByte, 1)));
}

TEST(LintAccessTest, NodesThatNoDeviceHasAreFound) {
    struct Case {
        const char* node;
        const char* message;
    };
    const Case cases[] = {
        {"0", "node 0 is all devices at once: reads are refused, and no device answers a write"},
        {"255", "node 255 stands for a disabled node: every access is refused"},
        {"257", "node 257 does not fit into a request, which goes to node 1"},
        {"256", "node 256 does not fit into a request, which goes to node 0, all devices at once"},
        {"511",
         "node 511 does not fit into a request, which goes to node 255: every access is refused"},
        {"-2", "node -2 does not fit into a request, which goes to node 254"},
    };
    for (const Case& each : cases) {
        const std::string uri = std::string(each.node) + "?HREG?400001?short";
        const Findings findings = findingsOf(acceptedTag(uri, 1, 0, 0, ICU_Type::short_, 2));
        ASSERT_EQ("unusable-node@1:1", placesOf(findings)) << uri;
        EXPECT_EQ(each.message, findings[0].message);
        EXPECT_EQ(Severity::Warning, findings[0].severity) << "an override may help";
    }
    for (const char* const node : {"1", "247", "254"}) {
        EXPECT_EQ("", lint(acceptedTag(std::string(node) + "?HREG?400001?short", 1, 0, 0,
                                       ICU_Type::short_, 2)));
    }
    // What never goes over the line may belong to any node.
    EXPECT_EQ("", lint(acceptedTag("255?NO?0?unsignedByte", 1, 0, 0, ICU_Type::unsignedByte, 1)));
}

TEST(LintAccessTest, NegativeSubIndexOfBitsIsAnError) {
    const TagLine bit = acceptedTag("1?HREG?400001.-1?boolean", 1, 0, -1, ICU_Type::boolean, 1);
    ASSERT_EQ("negative-subindex@1:8", lint(bit));
    EXPECT_EQ(Severity::Error, findingsOf(bit)[0].severity);
    EXPECT_EQ("negative-subindex@1:8",
              lint(acceptedTag("1?OUTP?1.-1?boolean", 1, 0, 0, ICU_Type::boolean, 1)));
    EXPECT_EQ("", lint(acceptedTag("1?HREG?400001.-1?short", 1, 0, -1, ICU_Type::short_, 2)));
}

TagLine coilArray(int node, int firstBit, int count) {
    TagLine tag = acceptedTag(std::to_string(node) + "?OUTP?1?boolean-" + std::to_string(count), 1,
                              0, firstBit, ICU_Type::booleanArray, count, ICU_Type::boolean);
    tag.facts->node = node;
    return tag;
}

TEST(LintAccessTest, CoilArraysBeyondOneByteNeedFunction15) {
    EXPECT_EQ("repeated-coils@1:10", lint(coilArray(3, 0, 9)));
    EXPECT_EQ("repeated-coils@1:10", lint(coilArray(3, 6, 3)));
    EXPECT_EQ("", lint(coilArray(3, 0, 8)));
    EXPECT_EQ("", lint(coilArray(3, 6, 2)));
    for (const int node : {1, 4, 9})
        EXPECT_EQ("", lint(coilArray(node, 0, 16))) << node;
    EXPECT_EQ(
        "with forceFunction=05 only the first 2 of 3 coils are written with their own values; the "
        "others repeat them",
        findingsOf(coilArray(3, 6, 3))[0].message);
}

TEST(LintAccessTest, CoilFunctionOfAllNodesIsHeeded) {
    const std::string config = "CfgVer=1 defNodeId=1 forceFunction=05 Node4::forceFunction=15";
    EXPECT_EQ("repeated-coils@1:10", placesOf(findingsOf(coilArray(1, 0, 16), config)));
    EXPECT_EQ("", placesOf(findingsOf(coilArray(4, 0, 16), config)));
    // What is not exactly 15 is function 5.
    EXPECT_EQ("repeated-coils@1:10",
              placesOf(findingsOf(coilArray(1, 0, 16), "CfgVer=1 forceFunction=0x0F")));
    TagLine readOnly = coilArray(3, 0, 16);
    readOnly.facts->readOnly = true;
    EXPECT_EQ("", lint(readOnly));
}

}  // namespace
}  // namespace lint
