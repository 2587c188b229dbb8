// The staging area of parameters.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "framework/ParameterReplacer.h"

namespace {

TEST(ReplacerGroup, NothingStagedLeavesTheOutputUntouched) {
    const GroupParameterReplacer staging;
    int value = 4711;
    EXPECT_FALSE(staging.get("baud", -1, value));
    EXPECT_EQ(value, 4711);
}

TEST(ReplacerGroup, StagedValueIsRead) {
    GroupParameterReplacer staging;
    staging.set("baud", -1, 38400);
    int value = 0;
    EXPECT_TRUE(staging.get("baud", -1, value));
    EXPECT_EQ(value, 38400);
}

TEST(ReplacerGroup, LaterValueReplacesTheEarlier) {
    GroupParameterReplacer staging;
    staging.set("baud", -1, 38400);
    staging.set("baud", -1, 1200);
    int value = 0;
    EXPECT_TRUE(staging.get("baud", -1, value));
    EXPECT_EQ(value, 1200);
    EXPECT_EQ(staging.staged().size(), 1u);
}

TEST(ReplacerGroup, GroupStandsBehindTheNameWithoutSeparator) {
    GroupParameterReplacer staging;
    staging.set("baud", 3, 1200);
    ASSERT_EQ(staging.staged().count("baud3"), 1u);
    int value = 0;
    EXPECT_TRUE(staging.get("baud", 3, value));
    EXPECT_EQ(value, 1200);
    EXPECT_TRUE(staging.get("baud3", -1, value));
    value = 4711;
    EXPECT_FALSE(staging.get("baud", -1, value));
    EXPECT_FALSE(staging.get("baud", 4, value));
    EXPECT_EQ(value, 4711);
}

TEST(ReplacerGroup, EntryKeepsThePlainNameAndTheGroup) {
    GroupParameterReplacer staging;
    staging.set("stop", 12, 2);
    staging.set("mode", -1, 1);
    const GroupParameterReplacer::Variant grouped = staging.staged().at("stop12");
    EXPECT_EQ(grouped.type, ParameterReplacer::integer);
    EXPECT_EQ(grouped.name, "stop");
    EXPECT_FALSE(grouped.boolValue);
    EXPECT_EQ(grouped.intValue, 2);
    EXPECT_EQ(grouped.stringValue, "");
    EXPECT_EQ(grouped.group, 12);
    EXPECT_EQ(staging.staged().at("mode").name, "mode");
    EXPECT_EQ(staging.staged().at("mode").group, -1);
}

TEST(ReplacerGroup, EntriesStandInKeyOrder) {
    GroupParameterReplacer staging;
    for (const char* name : {"stop", "baud", "parity", "mode", "Baud"})
        staging.set(name, -1, 1);
    std::vector<std::string> keys;
    for (const auto& [key, value] : staging.staged())
        keys.push_back(key);
    EXPECT_EQ(keys, (std::vector<std::string>{"Baud", "baud", "mode", "parity", "stop"}));
}

}  // namespace
