#include "cli/override/OverrideNotice.h"

#include <gtest/gtest.h>

#include "cli/override/OverrideKeys.h"

namespace {

using runtime::StoredEntry;
using runtime::StoredValue;

constexpr const char* kConfig =
    "CfgVer=1 defNodeId=1 model=1 uart=com1 baudrate=19200 parity=EVEN stopbits=1 mode=RS-232 "
    "Node2::model=2 Node3::model=3";

struct Row {
    StoredEntry entry;
    const char* text;  ///< Null: it makes no difference.
    const char* words;
};

TEST(OverrideNoticeTest, TellsWhatDiffersFromTheConfiguration) {
    const Row rows[] = {
        {{"baud", 38400}, "baud 38400 instead of 19200", "baud"},
        {{"baud", 19200}, nullptr, nullptr},
        {{"baud", std::string("9600")}, "baud 9600 instead of 19200", "baud"},
        {{"parity", 1}, nullptr, nullptr},
        {{"parity", 2}, "parity odd instead of EVEN", "parity"},
        {{"stop", 2}, "stop 2 instead of 1", "stop"},
        {{"mode", 1}, "mode RS-485 instead of RS-232", "mode"},
        {{"tempNode5", std::string("7")}, "node 5 = 7", "node 5"},
        {{"tempNode5", std::string("255")}, "node 5 = off", "node 5"},
        {{"tempNode5", std::string("5")}, nullptr, nullptr},
        {{"tempNode0x0A", std::string("017")}, "node 10 = 15", "node 10"},
        {{"node1_ModiconMode", false}, "modicon 1 = off", "modicon 1"},
        {{"node1_ModiconMode", true}, nullptr, nullptr},
        {{"node2_ModiconMode", true}, "modicon 2 = on", "modicon 2"},
        {{"node3_ModiconMode", true}, nullptr, nullptr},
        {{"node9_ModiconMode", false}, "modicon 9 = off", "modicon 9"},
        {{"something else", 5}, nullptr, nullptr},
    };
    for (const Row& row : rows) {
        const auto active = cli::activeOverrides({row.entry}, kConfig);
        ASSERT_EQ(row.text == nullptr ? 0U : 1U, active.size()) << row.entry.key;
        if (row.text == nullptr) continue;
        EXPECT_EQ(row.text, active[0].text);
        EXPECT_EQ(row.words, active[0].words);
    }
}

// A node's own model makes it count from 1 only where the model of all nodes does.
TEST(OverrideNoticeTest, KnowsTheDriversRuleForModiconMode) {
    const std::string config = "CfgVer=1 model=2 Node5::model=1";
    EXPECT_TRUE(cli::activeOverrides({{"node5_ModiconMode", false}}, config).empty());
    EXPECT_EQ(1U, cli::activeOverrides({{"node5_ModiconMode", true}}, config).size());
}

TEST(OverrideNoticeTest, KeysNameTheirNode) {
    EXPECT_EQ("tempNode5", cli::addressKey(5));
    EXPECT_EQ(5, cli::nodeOfAddressKey("tempNode5"));
    EXPECT_EQ(31, cli::nodeOfAddressKey("tempNode0x1F"));
    EXPECT_EQ(std::nullopt, cli::nodeOfAddressKey("node5_ModiconMode"));
    EXPECT_EQ("node5_ModiconMode", cli::modiconKey(5));
    EXPECT_EQ(5, cli::nodeOfModiconKey("node5_ModiconMode"));
    for (const char* const key :
         {"node_ModiconMode", "node5", "nodex_ModiconMode", "tempNode5", ""})
        EXPECT_EQ(std::nullopt, cli::nodeOfModiconKey(key)) << key;
}

}  // namespace
