#include "cli/override/OverrideWords.h"

#include <gtest/gtest.h>

#include "cli/ExitCode.h"

namespace {

std::string changeRefusal(const std::vector<std::string>& words) {
    try {
        cli::parseChanges(words);
    } catch (const cli::CommandError& error) {
        return error.code() == cli::ExitCode::Usage ? error.what() : "wrong exit code";
    }
    return "accepted";
}

std::string removalRefusal(const std::vector<std::string>& words) {
    try {
        cli::parseRemovals(words);
    } catch (const cli::CommandError& error) {
        return error.code() == cli::ExitCode::Usage ? error.what() : "wrong exit code";
    }
    return "accepted";
}

TEST(OverrideWordsTest, NodesModiconModeAndSettingsInOneGo) {
    const auto changes = cli::parseChanges({"node", "5=7", "6=off", "modicon", "5=on", "6=off",
                                            "baud=38400", "parity=Even", "stop=2", "mode=rs-485"});
    ASSERT_EQ(2U, changes.nodes.size());
    EXPECT_EQ(5, changes.nodes[0].node);
    EXPECT_EQ(7, changes.nodes[0].address);
    EXPECT_EQ(255, changes.nodes[1].address);
    ASSERT_EQ(2U, changes.modicon.size());
    EXPECT_TRUE(changes.modicon[0].on);
    EXPECT_FALSE(changes.modicon[1].on);
    ASSERT_EQ(4U, changes.serial.size());
    EXPECT_EQ("SP_Baud", changes.serial[0].setting->area);
    EXPECT_EQ(38400U, changes.serial[0].code);
    EXPECT_EQ(1U, changes.serial[1].code);
    EXPECT_EQ(2U, changes.serial[2].code);
    EXPECT_EQ(1U, changes.serial[3].code);
}

TEST(OverrideWordsTest, EveryWordHasItsCodeAndBack) {
    struct Row {
        const char* text;
        std::uint32_t code;
    };
    constexpr Row rows[] = {{"baud=150", 150},     {"baud=300", 300},       {"baud=600", 600},
                            {"baud=1200", 1200},   {"baud=2400", 2400},     {"baud=4800", 4800},
                            {"baud=9600", 9600},   {"baud=19200", 19200},   {"baud=38400", 38400},
                            {"baud=57600", 57600}, {"baud=115200", 115200}, {"parity=none", 0},
                            {"parity=even", 1},    {"parity=odd", 2},       {"parity=mark", 3},
                            {"parity=space", 4},   {"stop=1", 1},           {"stop=2", 2},
                            {"mode=RS-232", 0},    {"mode=RS-485", 1},      {"mode=RS-422", 2}};
    for (const Row& row : rows) {
        const auto changes = cli::parseChanges({row.text});
        ASSERT_EQ(1U, changes.serial.size()) << row.text;
        const cli::SerialChange& change = changes.serial[0];
        EXPECT_EQ(row.code, change.code) << row.text;
        EXPECT_EQ(row.text, std::string(change.setting->name) + "=" +
                                cli::wordOf(*change.setting, change.code));
    }
}

TEST(OverrideWordsTest, ACodeWithoutAWordIsShownAsItIs) {
    EXPECT_EQ("3", cli::wordOf(cli::serialSettings()[3], 3));
    EXPECT_EQ("off", cli::addressWord(255));
    EXPECT_EQ("7", cli::addressWord(7));
}

TEST(OverrideWordsTest, WhatCannotBeSetIsNamed) {
    struct Row {
        std::vector<std::string> words;
        const char* complaint;
    };
    const Row rows[] = {
        {{"baud=14400"},
         "'baud=14400': baud is one of 150, 300, 600, 1200, 2400, 4800, 9600, 19200, 38400, 57600, "
         "115200"},
        {{"parity=both"}, "'parity=both': parity is one of none, even, odd, mark, space"},
        {{"stop=7"}, "'stop=7': stop is one of 1, 2"},
        {{"mode=RS-485P"},
         "'mode=RS-485P': mode is one of RS-232, RS-485, RS-422; did you mean 'RS-485'?"},
        {{"pairty=even"},
         "'pairty=even': the settings are baud, parity, stop and mode; nodes go as 'node N=M'; did "
         "you mean 'parity'?"},
        {{"node", "5=256"}, "'5=256': '256' is no number from 0 to 255"},
        {{"node", "256=5"}, "'256=5': '256' is no number from 0 to 255"},
        {{"node", "-1=5"}, "'-1=5': '-1' is no number from 0 to 255"},
        {{"node", "5="}, "'5=': '' is no number from 0 to 255"},
        {{"node"}, "'node': a node number and its value must follow, e.g. 5=7"},
        {{"node", "modicon", "5=on"}, "'modicon': expected N=VALUE here"},
        {{"modicon", "5=maybe"}, "'5=maybe': Modicon mode is on or off"},
        {{"5=7"}, "'5=7': the settings are baud, parity, stop and mode; nodes go as 'node N=M'"},
        {{"speed"}, "'speed': expected node, modicon or SETTING=VALUE"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(row.complaint, changeRefusal(row.words));
}

TEST(OverrideWordsTest, RemovalsNameTheirThings) {
    const auto removals = cli::parseRemovals({"node", "5", "6", "baud", "modicon", "5", "mode"});
    EXPECT_EQ((std::vector<int>{5, 6}), removals.nodes);
    EXPECT_EQ(std::vector<int>{5}, removals.modicon);
    ASSERT_EQ(2U, removals.serial.size());
    EXPECT_EQ("baud", removals.serial[0]->name);
    EXPECT_EQ("mode", removals.serial[1]->name);
    EXPECT_FALSE(removals.all);
    EXPECT_TRUE(cli::parseRemovals({"all"}).all);
}

TEST(OverrideWordsTest, RemovalsOfSomethingElseAreRefused) {
    const std::vector<std::string> rows[] = {{"5"},           {"node"},      {"node", "x"},
                                             {"node", "256"}, {"baud=9600"}, {"all", "baud"}};
    for (const auto& words : rows) {
        EXPECT_NE(removalRefusal(words), "accepted") << words.back();
        EXPECT_NE(removalRefusal(words), "wrong exit code") << words.back();
    }
}

}  // namespace
