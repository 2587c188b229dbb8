// The indexed look-up against the rules as they are written: a key begins the text or follows white
// space, the first one counts, and a node is any "Node", digits, "::".
#include "framework/CfgItems.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <limits>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <string_view>
#include <vector>

#include "framework/CfgParser.h"

namespace {

constexpr std::string_view kWhiteSpace = " \t\n\v\f\r";
constexpr std::string_view kDigits = "0123456789";
constexpr long long kMost = std::numeric_limits<int>::max();

using Value = std::optional<std::string>;

/// Tries every place of the text in turn.
Value scanned(const std::string& text, const std::string& name) {
    const std::string key = name + "=";
    for (std::size_t at = 0; at < text.size(); ++at) {
        if (at != 0 && kWhiteSpace.find(text[at - 1]) == std::string_view::npos) continue;
        if (text.compare(at, key.size(), key) != 0) continue;
        const std::size_t value = at + key.size();
        return text.substr(value, text.find_first_of(kWhiteSpace, value) - value);
    }
    return std::nullopt;
}

std::vector<int> scannedNodes(const std::string& text) {
    std::vector<int> nodes;
    std::size_t at = text.find("Node");
    while (at != std::string::npos) {
        const std::size_t digits = at + 4;
        const std::size_t end = text.find("::", at);
        if (end == std::string::npos) break;
        const std::string number = text.substr(digits, end - digits);
        const bool isNode = number.find_first_not_of(kDigits) == std::string::npos;
        const int id = static_cast<int>(std::min(std::strtoll(number.c_str(), nullptr, 10), kMost));
        if (isNode && std::find(nodes.begin(), nodes.end(), id) == nodes.end()) nodes.push_back(id);
        at = text.find("Node", isNode ? end : digits);
    }
    return nodes;
}

Value looked(CfgParser& parser, const std::string& name) {
    const char* value = parser.GetParam(name.c_str());
    return value == nullptr ? Value() : Value(value);
}

std::vector<int> nodesOf(const CfgParser& parser) {
    std::vector<int> nodes;
    nodes.reserve(static_cast<std::size_t>(parser.GetNodeCount()));
    for (int index = 0; index < parser.GetNodeCount(); ++index)
        nodes.push_back(parser.GetNodeID(index));
    return nodes;
}

/// Words that meet in every way that a look-up could take for another.
std::string randomText(std::mt19937& random) {
    static const std::vector<std::string> kPieces{
        "a",  "b",     "ab",  "=",      "==",  "a=",         "b=1",     " ",         " ",      "\t",
        "\n", "\v",    "1",   "2",      "12",  "Node",       "Node1",   "Node2",     "Node12", "::",
        ":",  " Node", "a b", "&nbsp;", " a=", " Node1::a=", "Node1::", "xNode2::b="};
    std::string text;
    for (auto left = random() % 24; left > 0; --left)
        text += kPieces[random() % kPieces.size()];
    return text;
}

const std::vector<std::string> kNames{
    "a",         "b",  "ab",  "",  "1",   "Node1", "Node1::a", "Node12::b",
    "xNode2::b", "a=", "a=b", "=", "a b", " a",    "a\tb"};

TEST(CfgItemsTest, LookUpFindsWhatAScanFinds) {
    std::mt19937 random(1);
    int found = 0;
    for (int round = 0; round < 20000; ++round) {
        const std::string body = randomText(random);
        CfgParser parser(("CfgVer=1" + body).c_str());
        ASSERT_EQ(nodesOf(parser), scannedNodes(body)) << body;
        for (const std::string& name : kNames) {
            const Value expected = scanned(body, name);
            ASSERT_EQ(expected, looked(parser, name)) << "'" << name << "' in '" << body << "'";
            if (expected) ++found;
        }
    }
    EXPECT_GT(found, 1000) << "the texts hardly ever held the names";
}

TEST(CfgItemsTest, TextWithoutItsMarkerIsLookedUpTheSameWay) {
    std::mt19937 random(2);
    for (int round = 0; round < 5000; ++round) {
        const std::string text = randomText(random);
        CfgParser parser(text.c_str());
        for (const std::string& name : kNames)
            ASSERT_EQ(looked(parser, name), scanned(text, name)) << "'" << name << "' in " << text;
    }
}

TEST(CfgItemsTest, EveryItemOfALongTextIsFound) {
    constexpr int kNodes = 40000;
    std::string text = "CfgVer=1 timeout=1";
    for (int node = 0; node < kNodes; ++node)
        text += " Node" + std::to_string(node) + "::timeout=" + std::to_string(node + 7);
    CfgParser parser(text.c_str());
    ASSERT_EQ(kNodes, parser.GetNodeCount());
    for (int node = 0; node < kNodes; ++node) {
        std::string value;
        ASSERT_EQ(CfgParser::Found, parser.getParam("timeout", node, value, CfgParser::AnyPlace));
        ASSERT_EQ(std::to_string(node + 7), value);
    }
}

TEST(CfgItemsTest, CopyOfAParserOutlivesIt) {
    auto parser = std::make_unique<CfgParser>("CfgVer=1 a=1");
    CfgParser copy(*parser);
    parser.reset();
    EXPECT_STREQ("1", copy.GetParam("a"));
}

TEST(CfgItemsTest, NamesHoldNeitherEqualSignNorWhiteSpace) {
    for (const char* name : {"", "a", "Node1::a", "::", "&nbsp;"})
        EXPECT_TRUE(CfgItems::isName(name)) << name;
    for (const char* name : {"=", "a=", "a b", " a", "a\t", "\n", "a\vb", "\f", "\r"})
        EXPECT_FALSE(CfgItems::isName(name)) << name;
}

}  // namespace
