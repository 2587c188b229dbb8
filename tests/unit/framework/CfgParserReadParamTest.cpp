#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "framework/CfgParser.h"

namespace {

constexpr int kNoNode = -1;

TEST(CfgParserReadParamTest, ParseValueTurnsEveryNbspIntoABlank) {
    const std::pair<const char*, const char*> rows[] = {
        {"", ""},
        {"abc", "abc"},
        {"a&nbsp;b", "a b"},
        {"&nbsp;&nbsp;", "  "},
        {"&nbsp;a&nbsp;&nbsp;b&nbsp;", " a  b "},
        {"&NBSP;", "&NBSP;"},
        {"&nbsp", "&nbsp"},
        {"&&nbsp;nbsp;", "& nbsp;"},
    };
    for (const auto& [raw, text] : rows) {
        std::string value = "before";
        EXPECT_TRUE(CfgParserN::parseValue(raw, value)) << raw;
        EXPECT_EQ(text, value) << raw;
    }
}

TEST(CfgParserReadParamTest, ParseValueMayDecodeInPlace) {
    std::string value = "a&nbsp;b";
    EXPECT_TRUE(CfgParserN::parseValue(value, value));
    EXPECT_EQ("a b", value);
}

TEST(CfgParserReadParamTest, GetErrorStringSaysWhatIsWrong) {
    const std::pair<int, const char*> rows[] = {
        {0, "Parser: parameter 'uart' has unknown error"},
        {1, "Parser: parameter 'uart' has unknown error"},
        {2, "Parser: parameter 'uart' is not found"},
        {3, "Parser: parameter 'uart' has illegal value"},
        {4, "Parser: parameter 'uart' can't be prefixed"},
        {5, "Parser: parameter 'uart' can't be node independent"},
        {6, "Parser: parameter 'uart' has invalid internal specification"},
    };
    for (const auto& [result, text] : rows) {
        EXPECT_EQ(text,
                  CfgParserN::getErrorString(static_cast<CfgParser::parseResult>(result), "uart"));
    }
}

struct Reading {
    bool goOn = false;
    int value = -77;
    std::string error;
};

Reading ReadInt(const std::string& body, int node, int flags, bool optional) {
    CfgParser parser(("CfgVer=1 " + body).c_str());
    Reading reading;
    reading.goOn =
        readParam<int>(parser, "timeout", node, reading.value, flags, optional, reading.error);
    return reading;
}

TEST(CfgParserReadParamTest, ReadParamReadsIntegersWithAutomaticBase) {
    const std::pair<const char*, int> rows[] = {
        {"timeout=0x10", 16}, {"timeout=010", 8},   {"timeout=12abc", 12},
        {"timeout=abc", 0},   {"timeout=", 0},      {"timeout=-5", -5},
        {"timeout=+5", 5},    {"timeout=0X1F", 31}, {"timeout=99999999999", 2147483647},
    };
    for (const auto& [body, value] : rows) {
        const Reading reading = ReadInt(body, kNoNode, 0, false);
        EXPECT_TRUE(reading.goOn) << body;
        EXPECT_EQ(value, reading.value) << body;
        EXPECT_EQ("", reading.error) << body;
    }
}

TEST(CfgParserReadParamTest, ReadParamLeavesTheDefaultOfAnOptionalParameter) {
    const Reading reading = ReadInt("repeat=2", kNoNode, 0, true);
    EXPECT_TRUE(reading.goOn);
    EXPECT_EQ(-77, reading.value);
    EXPECT_EQ("", reading.error);
}

TEST(CfgParserReadParamTest, ReadParamReportsARequiredParameterThatIsMissing) {
    const Reading reading = ReadInt("repeat=2", kNoNode, 0, false);
    EXPECT_FALSE(reading.goOn);
    EXPECT_EQ(-77, reading.value);
    EXPECT_EQ("Parser: parameter 'timeout' is not found", reading.error);
}

TEST(CfgParserReadParamTest, ReadParamGoesOnWithoutANodeParameterWhenNoNodeAsks) {
    const Reading reading = ReadInt("Node1::timeout=5", kNoNode, CfgParser::NodeOnly, false);
    EXPECT_TRUE(reading.goOn);
    EXPECT_EQ(-77, reading.value);
    EXPECT_EQ("", reading.error);
}

TEST(CfgParserReadParamTest, ReadParamReportsMisplacedParametersEvenWhenOptional) {
    struct Row {
        const char* body;
        int node;
        int flags;
        const char* error;
    };
    const Row rows[] = {
        {"Node1::timeout=5", 1, 1, "Parser: parameter 'timeout' can't be prefixed"},
        {"timeout=5 Node1::x=1", kNoNode, 2,
         "Parser: parameter 'timeout' can't be node independent"},
        {"timeout=5", kNoNode, 3, "Parser: parameter 'timeout' has invalid internal specification"},
    };
    for (const Row& row : rows) {
        const Reading reading = ReadInt(row.body, row.node, row.flags, true);
        EXPECT_FALSE(reading.goOn) << row.body;
        EXPECT_EQ(-77, reading.value) << row.body;
        EXPECT_EQ(row.error, reading.error);
    }
}

TEST(CfgParserReadParamTest, ReadParamDecodesTexts) {
    CfgParser parser("CfgVer=1 name=a&nbsp;b Node2::name=c");
    std::string value = "before";
    std::string error;
    EXPECT_TRUE(readParam<std::string>(parser, "name", kNoNode, value, 0, false, error));
    EXPECT_EQ("a b", value);
    EXPECT_TRUE(readParam<std::string>(parser, "name", 2, value, 0, false, error));
    EXPECT_EQ("c", value);
    EXPECT_FALSE(readParam<std::string>(parser, "other", 2, value, 0, false, error));
    EXPECT_EQ("c", value);
    EXPECT_EQ("Parser: parameter 'other' is not found", error);
}

}  // namespace
