// Texts from outside, thrown at the parsers: made of the grammar's own pieces, so that they reach
// deep, and always the same ones. A sanitizer build watches the memory.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "framework/CfgParser.h"
#include "framework/DataTypes.h"
#include "framework/TextUtils.h"
#include "tests/unit/framework/ValueTag.h"

namespace {

constexpr int kRounds = 20000;

using Pieces = std::vector<std::string>;

class TextMaker {
  public:
    TextMaker(Pieces pieces, unsigned seed) : pieces_(std::move(pieces)), random_(seed) {}

    std::string next() {
        std::string text;
        for (std::uint32_t left = below(12); left > 0; --left)
            text += piece();
        return text;
    }

  private:
    // Not std::uniform_int_distribution: its results differ between libraries.
    std::uint32_t below(std::uint32_t bound) {
        return static_cast<std::uint32_t>(random_() % bound);
    }

    std::string piece() {
        if (below(8) == 0) return std::string(1, static_cast<char>(1 + below(255)));
        return pieces_[below(static_cast<std::uint32_t>(pieces_.size()))];
    }

    Pieces pieces_;
    std::mt19937 random_;
};

TEST(HostileTextsTest, NeverMakeADataTypeOfNoRow) {
    Pieces pieces = {"(", ")", ",", "-", " ", "\t", "0", "7", "99999999999", "-5", "swap2", "bcd"};
    for (const auto& row : ProtUtilsN::DataTypes)
        pieces.emplace_back(row.typeString);
    TextMaker texts(pieces, 1);

    int accepted = 0;
    for (int round = 0; round < kRounds; ++round) {
        const std::string text = texts.next();
        ICU_Type type = ICU_Type::none;
        ICU_Type element = ICU_Type::none;
        int length = -77;
        Pieces conversions;
        if (!ProtUtilsN::GetICOMType(text, type, element, length, conversions)) {
            ASSERT_EQ(ICU_Type::none, type) << text;
            ASSERT_EQ(-77, length) << text;
            continue;
        }
        ++accepted;
        const auto code = static_cast<std::size_t>(type);
        ASSERT_TRUE(code >= 1 && code <= ProtUtilsN::DataTypes.size()) << text;
        const ProtUtilsN::DataType& row = ProtUtilsN::DataTypes[code - 1];
        ASSERT_EQ(row.elementType, element) << text;
        ASSERT_NE(text.find(row.typeString), std::string::npos) << text;
        if (row.fixedLength != 0) {
            ASSERT_EQ(row.fixedLength, length) << text;
        }
    }
    EXPECT_GT(accepted, 100) << "the texts no longer reach the table";
}

std::size_t AtLeastZero(int length) {
    return static_cast<std::size_t>(std::max(length, 0));
}

// Bits are counted from the start of the image, and their length in bytes only from the first one.
std::size_t ImageLength(const ValueTag& tag) {
    if (!ProtUtilsN::IsBitType(&tag)) return AtLeastZero(tag.PackedLen());
    return AtLeastZero(tag.GetBitIndex() + tag.GetVarLength() + 7) / 8;
}

TEST(HostileTextsTest, NeverLeadATagOutOfItsBuffers) {
    TextMaker texts({"int",      "short",    "boolean", "byte",  "-",          "3",
                     "1",        "(",        ")",       ",",     "swap2",      "swap4",
                     "swap8",    "bcd",      "neg",     "inv",   "swapnibble", "double",
                     "binary-9", "string-5", "time",    "(bcd)", "-4(neg)",    "-12(swap2,inv)"},
                    2);
    int converted = 0;
    for (int round = 0; round < kRounds; ++round) {
        const ValueTag tag(texts.next(), 0, round % 19);
        if (tag.GetVarLength() > 4096) continue;
        std::vector<unsigned char> device(ImageLength(tag), 0x21);
        std::vector<unsigned char> value(AtLeastZero(tag.GetVarLength()), 0);
        const bool ok = tag.Convert(device.data(), value.data(), false);
        if (!ok) {
            ASSERT_EQ(std::ssize(value), std::count(value.begin(), value.end(), 0));
            ASSERT_EQ(0U, std::string(tag.getError()).rfind("Conversion error at: ", 0));
            continue;
        }
        if (!tag.Convert(value.data(), device.data(), true)) continue;
        ++converted;
        ASSERT_EQ(std::vector<unsigned char>(device.size(), 0x21), device) << tag.GetVarName();
    }
    EXPECT_GT(converted, 100);
}

TEST(HostileTextsTest, NeverMakeAParameterOfAnotherOne) {
    TextMaker texts({"CfgVer=1", "CfgVer=1 ", "CfgVer=", "Node", "Node1", "Node2::", "::", ":", " ",
                     "\n", "timeout=", "timeout", "=", "uart=com1", "&nbsp;", "7", "0x", "-"},
                    3);
    int found = 0;
    for (int round = 0; round < kRounds; ++round) {
        const std::string text = texts.next();
        CfgParser parser(text.c_str());
        ASSERT_EQ(text.find("CfgVer=1") != std::string::npos, parser.KnownFormat()) << text;

        std::set<int> nodes;
        for (int i = 0; i < parser.GetNodeCount(); ++i) {
            ASSERT_GE(parser.GetNodeID(i), 0) << text;
            ASSERT_TRUE(nodes.insert(parser.GetNodeID(i)).second) << text;
        }

        std::string value = "before";
        const int result = parser.getParam("timeout", 2, value, CfgParser::AnyPlace);
        if (result != CfgParser::Found) {
            ASSERT_EQ(CfgParser::NotFound, result) << text;
            ASSERT_EQ("before", value) << text;
            continue;
        }
        ++found;
        ASSERT_NE(text.find("timeout=" + value), std::string::npos) << text;
        ASSERT_TRUE(std::none_of(value.begin(), value.end(), ProtUtilsN::isWhiteSpace)) << text;
    }
    EXPECT_GT(found, 100);
}

// A driver reads all parameters of all nodes: the search must not grow out of hand.
TEST(HostileTextsTest, NodesWithoutEndAreCollectedOnce) {
    std::string text = "CfgVer=1 ";
    for (int i = 0; i < 200000; ++i)
        text += "Node";
    text += "4::x=1";
    const CfgParser parser(text.c_str());
    ASSERT_EQ(1, parser.GetNodeCount());
    EXPECT_EQ(4, parser.GetNodeID(0));
}

}  // namespace
