#include "framework/CfgParser.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

constexpr int kNoNode = -1;

std::vector<int> NodesOf(const std::string& text) {
    const CfgParser parser(text.c_str());
    std::vector<int> nodes;
    nodes.reserve(static_cast<std::size_t>(parser.GetNodeCount()));
    for (int i = 0; i < parser.GetNodeCount(); ++i)
        nodes.push_back(parser.GetNodeID(i));
    return nodes;
}

// The raw value, or "(none)".
std::string ParamOf(const std::string& text, const char* name) {
    CfgParser parser(text.c_str());
    const char* value = parser.GetParam(name);
    return value == nullptr ? "(none)" : value;
}

TEST(CfgParserTest, NeedsItsMarker) {
    struct Row {
        const char* text;
        bool known;
    };
    const Row rows[] = {
        {"", false},
        {"timeout=5", false},
        {"CfgVer=2 timeout=5", false},
        {"cfgver=1", false},
        {"CfgVer=", false},
        {"CfgVer=1", true},
        {"junk CfgVer=1 a=1", true},
        {"CfgVer=12", true},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(row.known, CfgParser(row.text).KnownFormat()) << row.text;
    }
}

TEST(CfgParserTest, TakesNoTextForAnEmptyOne) {
    CfgParser parser(nullptr);
    EXPECT_FALSE(parser.KnownFormat());
    EXPECT_EQ(nullptr, parser.GetParam("a"));
}

TEST(CfgParserTest, KeepsTheWholeTextAndNoNodesWithoutItsMarker) {
    CfgParser parser("timeout=5 Node3::timeout=7");
    EXPECT_EQ(0, parser.GetNodeCount());
    EXPECT_STREQ("5", parser.GetParam("timeout"));
    EXPECT_STREQ("7", parser.GetParam("Node3::timeout"));
}

TEST(CfgParserTest, IgnoresWhatIsInFrontOfItsMarker) {
    EXPECT_EQ(ParamOf("timeout=5 CfgVer=1 timeout=7", "timeout"), "7");
    EXPECT_EQ(ParamOf("timeout=5 CfgVer=1", "timeout"), "(none)");
    EXPECT_EQ(NodesOf("Node1::a=1 CfgVer=1 Node2::a=1"), std::vector<int>{2});
}

TEST(CfgParserTest, EndsAtTheNextMarkerOfAnyVersion) {
    for (const char* second : {"CfgVer=1", "CfgVer=2", "CfgVer="}) {
        const std::string text = std::string("CfgVer=1 a=1 ") + second + " b=2 Node4::a=3";
        EXPECT_EQ("1", ParamOf(text, "a")) << text;
        EXPECT_EQ("(none)", ParamOf(text, "b")) << text;
        EXPECT_EQ(std::vector<int>{}, NodesOf(text)) << text;
    }
}

TEST(CfgParserTest, ListsNodesInOrderOfFirstAppearance) {
    const std::vector<std::pair<std::string, std::vector<int>>> rows = {
        {"", {}},
        {"Node3::a=1 Node1::a=1 Node3::b=1", {3, 1}},
        {"Node::x=1", {0}},
        {"NodeA::x=1", {}},
        {"Node-1::x=1", {}},
        {"Node 1::x=1", {}},
        {"node1::x=1", {}},
        {"Node1:x=1 Node2::x=1", {2}},
        {"Node1x=1 Node2::x=1", {2}},
        {"Node07::x=1 Node7::y=1", {7}},
        {"NodeNode5::x=1", {5}},
        {"x=Node6::", {6}},
        {"Node1:::x Node2:: Node", {1, 2}},
        {"Node99999999999::x=1", {2147483647}},
        {"Node", {}},
        {"Node12", {}},
        {"Node12:", {}},
    };
    for (const auto& [body, nodes] : rows) {
        EXPECT_EQ(nodes, NodesOf("CfgVer=1 " + body)) << body;
    }
}

TEST(CfgParserTest, NumbersNodesFromZeroOnly) {
    const CfgParser parser("CfgVer=1 Node3::a=1 Node9::a=1");
    EXPECT_EQ(2, parser.GetNodeCount());
    EXPECT_EQ(9, parser.GetNodeID(1));
    EXPECT_EQ(0, parser.GetNodeID(2));
    EXPECT_EQ(0, parser.GetNodeID(-1));
}

TEST(CfgParserTest, GetParamFindsItemsWhereTheyBegin) {
    struct Row {
        const char* body;
        const char* name;
        const char* value;
    };
    const Row rows[] = {
        {" timeout=7", "timeout", "7"},
        {"timeout=7", "timeout", "7"},  // the body begins right behind the marker
        {" xtimeout=5 timeout=7", "timeout", "7"},
        {" timeout=5 timeout=7", "timeout", "5"},
        {" Node2::timeout=9", "timeout", "(none)"},
        {" Node2::timeout=9", "Node2::timeout", "9"},
        {" Node12::timeout=9", "Node2::timeout", "(none)"},
        {" Timeout=5", "timeout", "(none)"},
        {" timeout =5", "timeout", "(none)"},
        {" timeout", "timeout", "(none)"},
        {" timeout= repeat=2", "timeout", ""},
        {" timeout=", "timeout", ""},
        {" a=b=c", "a", "b=c"},
        {" a=x;y,z\"q\" b=1", "a", "x;y,z\"q\""},
        {" a=x&nbsp;y", "a", "x&nbsp;y"},
        {"\na=1\tb=2\rc=3\vd=4\fe=5", "a", "1"},
        {"\na=1\tb=2\rc=3\vd=4\fe=5", "b", "2"},
        {"\na=1\tb=2\rc=3\vd=4\fe=5", "c", "3"},
        {"\na=1\tb=2\rc=3\vd=4\fe=5", "d", "4"},
        {"\na=1\tb=2\rc=3\vd=4\fe=5", "e", "5"},
        {" aa=1 a=2", "a", "2"},
        {" a=a=a a=3", "a", "a=a"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(ParamOf(std::string("CfgVer=1") + row.body, row.name), row.value)
            << row.body << " / " << row.name;
    }
}

TEST(CfgParserTest, GetParamKeepsItsValueUntilTheNextCall) {
    CfgParser parser("CfgVer=1 a=first b=second");
    EXPECT_STREQ("first", parser.GetParam("a"));
    const char* second = parser.GetParam("b");
    EXPECT_STREQ("second", second);
}

constexpr int kBoth = CfgParser::CommonOnly | CfgParser::NodeOnly;

struct LookupRow {
    const char* body;
    int node;
    int flags;
    int result;
    const char* value;  // "before" where the result delivers none
};

constexpr LookupRow kLookups[] = {
    // a node's own value, then the common one
    {"uart=com1 Node2::uart=com2", 2, 0, 0, "com2"},
    {"uart=com1 Node2::uart=com2", 3, 0, 0, "com1"},
    {"uart=com1", 2, 0, 0, "com1"},
    {"Node3::uart=com3", 2, 0, 2, "before"},
    {"", 2, 0, 2, "before"},
    {"Node2::uart=", 2, 0, 0, ""},
    {"Node0::uart=com5", 0, 0, 0, "com5"},
    // common only: the prefix counts when that node asks
    {"Node2::uart=com2", 2, 1, 4, "before"},
    {"uart=com1 Node2::uart=com2", 2, 1, 4, "before"},
    {"uart=com1 Node2::uart=com2", 3, 1, 0, "com1"},
    {"uart=com1 Node2::uart=com2", kNoNode, 1, 0, "com1"},
    {"Node2::uart=com2", kNoNode, 1, 2, "before"},
    // node only
    {"uart=com1 Node2::x=1", kNoNode, 2, 5, "before"},
    {"Node2::uart=com2", kNoNode, 2, 1, "before"},
    {"uart=com1", kNoNode, 2, 0, "com1"},
    {"", kNoNode, 2, 2, "before"},
    {"uart=com1 Node2::x=1", 2, 2, 0, "com1"},
    {"Node2::uart=com2", 2, 2, 0, "com2"},
    // no node, any place
    {"uart=com1 Node2::uart=com2", kNoNode, 0, 0, "com1"},
    {"Node2::uart=com2", kNoNode, 0, 2, "before"},
    // the value stays raw
    {"uart=a&nbsp;b", kNoNode, 0, 0, "a&nbsp;b"},
    // the impossible request is noticed first
    {"uart=com1 Node2::uart=com2", 2, kBoth, 6, "before"},
    {"", kNoNode, kBoth, 6, "before"},
};

TEST(CfgParserTest, GetParamAnswersByPlaceAndFlags) {
    for (const LookupRow& row : kLookups) {
        CfgParser parser((std::string("CfgVer=1 ") + row.body).c_str());
        std::string value = "before";
        EXPECT_EQ(row.result, parser.getParam("uart", row.node, value, row.flags))
            << row.body << " node " << row.node << " flags " << row.flags;
        EXPECT_EQ(row.value, value) << row.body << " node " << row.node << " flags " << row.flags;
    }
}

}  // namespace
