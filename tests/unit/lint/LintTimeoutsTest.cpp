// Timeouts against the time that replies take on their line.
#include "lint/LintTimeouts.h"

#include <gtest/gtest.h>

#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

/// 8 data bits, parity and 1 stop bit: 11 bits a character.
const std::string kLine = "CfgVer=1 defNodeId=1 txMode=RTU parity=even stopbits=1 ";

Findings findingsOf(const std::string& items, const std::vector<TagLine>& tags = {},
                    const std::string& line = kLine) {
    return lintTimeouts(settings::scanConfig("line", line + items), sampleDescription(), tags);
}

TagLine registers(int count, int node = 1) {
    TagLine tag = acceptedTag("1?HREG?400001?short-" + std::to_string(count), 1, 0, 0,
                              ICU_Type::shortArray, 2 * count, ICU_Type::short_);
    tag.facts->node = node;
    return tag;
}

TagLine coils(int count) {
    return acceptedTag("1?OUTP?1?boolean-" + std::to_string(count), 1, 0, 0, ICU_Type::booleanArray,
                       count, ICU_Type::boolean);
}

TEST(LintTimeoutsTest, TheRestOfTheLongestReplyMustFit) {
    // 254 characters x 11 bits / 9600 baud = 291.04 ms
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=292").empty());
    const Findings findings = findingsOf("baudrate=9600 timeout=291");
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ(Severity::Warning, findings[0].severity);
    EXPECT_EQ("short-timeout", findings[0].rule);
    EXPECT_EQ(
        "timeout=291 cuts the longest reply: its 255 characters go on for 292 ms after the first, "
        "at 9600 baud and 11 bits a character",
        findings[0].message);
    EXPECT_EQ("write timeout=330, or more for a device that takes its time to answer",
              findings[0].suggestion);
    EXPECT_EQ(static_cast<int>((kLine + "baudrate=9600 timeout=").size()) + 1,
              findings[0].place.column);
}

TEST(LintTimeoutsTest, TheFormatOfACharacterCounts) {
    // 254 characters of 10 bits: 264.6 ms; of 12: 317.5 ms.
    const std::string none = "CfgVer=1 defNodeId=1 parity=none stopbits=1 baudrate=9600 ";
    EXPECT_TRUE(findingsOf("timeout=265", {}, none).empty());
    EXPECT_FALSE(findingsOf("timeout=264", {}, none).empty());
    const std::string two = "CfgVer=1 defNodeId=1 parity=odd stopbits=2 baudrate=9600 ";
    EXPECT_TRUE(findingsOf("timeout=318", {}, two).empty());
    EXPECT_FALSE(findingsOf("timeout=317", {}, two).empty());
    // ASCII: 511 characters, 510 x 10 bits: 531.25 ms.
    const std::string ascii =
        "CfgVer=1 defNodeId=1 txMode=ASCII bits=7 parity=even stopbits=1 baudrate=9600 ";
    EXPECT_TRUE(findingsOf("timeout=532", {}, ascii).empty());
    EXPECT_FALSE(findingsOf("timeout=531", {}, ascii).empty());
}

TEST(LintTimeoutsTest, OfTagsTheLongestReplyCounts) {
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=100", {registers(1), coils(8)}).empty());
    const Findings findings =
        findingsOf("baudrate=9600 timeout=100", {registers(1), registers(60), registers(40)});
    ASSERT_EQ(1U, findings.size());
    EXPECT_NE(std::string::npos,
              findings[0].message.find("cuts the reply to '1?HREG?400001?short-60': its 125"));
    // 2000 coils are 250 bytes; 1000 of them 130 characters, 149 ms.
    EXPECT_EQ(1U, findingsOf("baudrate=9600 timeout=140", {coils(1000)}).size());
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=150", {coils(1000)}).empty());
}

TEST(LintTimeoutsTest, ALongArrayIsReadInSeveralRequests) {
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=292", {registers(1000)}).empty());
    // 20 registers a request: 45 characters.
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=60 maxOptLen=40", {registers(1000)}).empty());
    EXPECT_EQ(1U,
              findingsOf("baudrate=9600 timeout=60 Node1::maxOptLen=60", {registers(1000)}).size());
}

TEST(LintTimeoutsTest, ANodesOwnTimeoutIsJudgedByWhatIsReadThere) {
    const std::string items = "baudrate=9600 timeout=2000 Node2::timeout=50";
    EXPECT_TRUE(findingsOf(items, {registers(125)}).empty());
    const Findings findings = findingsOf(items, {registers(125), registers(100, 2)});
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ("write Node2::timeout=260, or more for a device that takes its time to answer",
              findings[0].suggestion);
    EXPECT_EQ(1U, findingsOf(items).size());
}

TEST(LintTimeoutsTest, TheDefaultTimeoutIsJudgedAtTheBaudRate) {
    EXPECT_TRUE(findingsOf("baudrate=9600").empty());
    EXPECT_TRUE(findingsOf("baudrate=1200", {registers(1)}).empty());
    // 254 x 11 / 1200 = 2328.3 ms
    const Findings findings = findingsOf("baudrate=1200");
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ(0U, findings[0].message.find("the default timeout=2000 cuts the longest reply"));
    EXPECT_EQ(static_cast<int>((kLine + "baudrate=").size()) + 1, findings[0].place.column);
}

TEST(LintTimeoutsTest, AReplyMustBeAbleToBegin) {
    // 3.5 characters of silence and one of reply, 11 bits each, at 150 baud: 330 ms.
    const Findings findings = findingsOf("baudrate=150 timeout=329", {registers(1)});
    ASSERT_EQ(1U, findings.size());
    EXPECT_EQ(
        "timeout=329 is over before a reply can begin, 330 ms after the request, at 150 baud and "
        "11 bits a character",
        findings[0].message);
    EXPECT_EQ(1U, findingsOf("baudrate=115200 timeout=0", {registers(1)}).size());
}

TEST(LintTimeoutsTest, WhatNeverUsesTheLineDoesNotCount) {
    TagLine refused = registers(125);
    refused.facts.reset();
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=50", {refused}).empty());
    EXPECT_TRUE(findingsOf("baudrate=9600 timeout=0",
                           {acceptedTag("1?NO?0?unsignedByte", 1, 0, 0, ICU_Type::unsignedByte, 1)})
                    .empty());
    EXPECT_TRUE(findingsOf("timeout=1").empty());
    EXPECT_TRUE(findingsOf("baudrate=0 timeout=1").empty());
}

}  // namespace
}  // namespace lint
