#include "cli/SimNodes.h"

#include <gtest/gtest.h>

namespace {

TEST(SimNodes, AreOneToTen) {
    const auto nodes = cli::defaultSimNodes(false);
    ASSERT_EQ(nodes.size(), 10U);
    EXPECT_EQ(nodes.front().address, 1);
    EXPECT_EQ(nodes.back().address, 10);
    EXPECT_TRUE(nodes.front().longs.has_value());
    EXPECT_FALSE(cli::defaultSimNodes(true).front().longs.has_value());
}

TEST(SimNodes, FollowTheConfiguration) {
    const auto nodes =
        cli::simNodesFor("CfgVer=1 defNodeId=77 model=1 Node2::model=4 Node300::x=1 Node0::x=1");
    ASSERT_EQ(nodes.size(), 11U);
    EXPECT_EQ(nodes.back().address, 77);
    EXPECT_FALSE(nodes.back().longs.has_value());
    EXPECT_FALSE(nodes[0].longs.has_value());
    EXPECT_TRUE(nodes[1].longs.has_value());
}

}  // namespace
