#include "cli/SimNodes.h"

#include <gtest/gtest.h>

namespace {

TEST(SimNodesTest, AreOneToTen) {
    const auto nodes = cli::defaultSimNodes(false);
    ASSERT_EQ(10U, nodes.size());
    EXPECT_EQ(1, nodes.front().address);
    EXPECT_EQ(10, nodes.back().address);
    EXPECT_TRUE(nodes.front().longs.has_value());
    EXPECT_FALSE(cli::defaultSimNodes(true).front().longs.has_value());
}

TEST(SimNodesTest, FollowTheConfiguration) {
    const auto nodes =
        cli::simNodesFor("CfgVer=1 defNodeId=77 model=1 Node2::model=4 Node300::x=1 Node0::x=1");
    ASSERT_EQ(11U, nodes.size());
    EXPECT_EQ(77, nodes.back().address);
    EXPECT_FALSE(nodes.back().longs.has_value());
    EXPECT_FALSE(nodes[0].longs.has_value());
    EXPECT_TRUE(nodes[1].longs.has_value());
}

}  // namespace
