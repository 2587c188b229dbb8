// The staging area of parameters.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "framework/ParameterReplacer.h"

namespace {

TEST(ReplacerGroupTest, NothingStagedLeavesTheOutputUntouched) {
    const GroupParameterReplacer staging;
    int value = 4711;
    EXPECT_FALSE(staging.get("baud", -1, value));
    EXPECT_EQ(4711, value);
}

TEST(ReplacerGroupTest, StagedValueIsRead) {
    GroupParameterReplacer staging;
    staging.set("baud", -1, 38400);
    int value = 0;
    EXPECT_TRUE(staging.get("baud", -1, value));
    EXPECT_EQ(38400, value);
}

TEST(ReplacerGroupTest, LaterValueReplacesTheEarlier) {
    GroupParameterReplacer staging;
    staging.set("baud", -1, 38400);
    staging.set("baud", -1, 1200);
    int value = 0;
    EXPECT_TRUE(staging.get("baud", -1, value));
    EXPECT_EQ(1200, value);
    EXPECT_EQ(1u, staging.staged().size());
}

TEST(ReplacerGroupTest, GroupStandsBehindTheNameWithoutSeparator) {
    GroupParameterReplacer staging;
    staging.set("baud", 3, 1200);
    ASSERT_EQ(1u, staging.staged().count("baud3"));
    int value = 0;
    EXPECT_TRUE(staging.get("baud", 3, value));
    EXPECT_EQ(1200, value);
    EXPECT_TRUE(staging.get("baud3", -1, value));
    value = 4711;
    EXPECT_FALSE(staging.get("baud", -1, value));
    EXPECT_FALSE(staging.get("baud", 4, value));
    EXPECT_EQ(4711, value);
}

TEST(ReplacerGroupTest, EntryKeepsThePlainNameAndTheGroup) {
    GroupParameterReplacer staging;
    staging.set("stop", 12, 2);
    staging.set("mode", -1, 1);
    const GroupParameterReplacer::Variant grouped = staging.staged().at("stop12");
    EXPECT_EQ(ParameterReplacer::Integer, grouped.type);
    EXPECT_EQ("stop", grouped.name);
    EXPECT_FALSE(grouped.boolValue);
    EXPECT_EQ(2, grouped.intValue);
    EXPECT_EQ("", grouped.stringValue);
    EXPECT_EQ(12, grouped.group);
    EXPECT_EQ("mode", staging.staged().at("mode").name);
    EXPECT_EQ(-1, staging.staged().at("mode").group);
}

TEST(ReplacerGroupTest, EntriesStandInKeyOrder) {
    GroupParameterReplacer staging;
    for (const char* name : {"stop", "baud", "parity", "mode", "Baud"})
        staging.set(name, -1, 1);
    std::vector<std::string> keys;
    for (const auto& [key, value] : staging.staged())
        keys.push_back(key);
    EXPECT_EQ((std::vector<std::string>{"Baud", "baud", "mode", "parity", "stop"}), keys);
}

}  // namespace
