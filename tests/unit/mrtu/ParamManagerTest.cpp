// The records of a configuration: whose they are, and when they change.
#include <climits>

#include "tests/unit/mrtu/ParamTexts.h"

namespace {

using _MRTU::ParamManager;
using driver_test::messageForWhole;
using driver_test::parse;

TEST(ParamManagerTest, MarkerIsRequired) {
    for (const char* text : {"", "timeout=5", "CfgVer=2 timeout=5", "cfgver=1"})
        EXPECT_EQ("Parser: unknown format", messageForWhole(text)) << text;
}

TEST(ParamManagerTest, NodesStandInOrderOfAppearance) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "Node3::timeout=3 Node1::timeout=1 Node3::delay=7"));
    ASSERT_EQ(2U, params.nodes().size());
    EXPECT_EQ(3, params.nodes()[0].nodeId);
    EXPECT_EQ(3, params.nodes()[0].timeout);
    EXPECT_EQ(7, params.nodes()[0].delay);
    EXPECT_EQ(1, params.nodes()[1].nodeId);
    EXPECT_EQ(1, params.nodes()[1].timeout);
}

TEST(ParamManagerTest, UnknownNodeGetsTheWideRecord) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=700 Node2::timeout=90"));
    EXPECT_EQ(700, params.getNodeParams(5)->timeout);
    EXPECT_EQ(700, params.getNodeParams(-1)->timeout);
    EXPECT_EQ(params.getNodeParams(5), params.getNodeParams(6));
}

TEST(ParamManagerTest, NeverWithoutARecord) {
    const ParamManager params;
    ASSERT_NE(nullptr, params.getNodeParams(1));
    EXPECT_EQ(2000, params.getNodeParams(1)->timeout);
    ASSERT_NE(nullptr, params.getCommonParams());
    EXPECT_STREQ("", params.getLastError());
    EXPECT_EQ(0, params.getMaxTm());
}

struct MaxTmCase {
    const char* items;
    int maxTm;
};

TEST(ParamManagerTest, MaximumTransactionTime) {
    const MaxTmCase cases[] = {
        {"", 4000},
        {"timeout=2000 repeat=2 Node2::timeout=100 Node2::repeat=5", 4000},
        {"timeout=100 repeat=1 Node2::timeout=300 Node3::timeout=200", 300},
        {"repeat=0", 0},
        {"repeat=-1", 0},
        {"timeout=100 repeat=-1 Node2::repeat=1", 100},
        {"timeout=2000000000 repeat=2", INT_MAX},
        {"timeout=100 repeat=1 Node2::timeout=65536 Node2::repeat=65536", INT_MAX},
    };
    for (const MaxTmCase& time : cases) {
        ParamManager params;
        ASSERT_EQ("", parse(params, time.items)) << time.items;
        EXPECT_EQ(time.maxTm, params.getMaxTm()) << time.items;
    }
}

TEST(ParamManagerTest, MaximumTransactionTimeStartsAfreshWithEveryText) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=9000"));
    ASSERT_EQ("", parse(params, "timeout=10"));
    EXPECT_EQ(20, params.getMaxTm());
    EXPECT_TRUE(params.nodes().empty());
}

TEST(ParamManagerTest, RefusedTextLeavesTheRecordsInForce) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=700 Node2::timeout=90"));
    for (const char* bad : {"CfgVer=2", "CfgVer=1 timeout=5", "CfgVer=1 maxOptLen=-1 defNodeId=1",
                            "CfgVer=1 timeout=5 defNodeId=1 uart=com9 Node2::timeout=3"}) {
        EXPECT_FALSE(params.parse(bad)) << bad;
        EXPECT_EQ(700, params.getNodeParams(1)->timeout) << bad;
        EXPECT_EQ(90, params.getNodeParams(2)->timeout) << bad;
        EXPECT_EQ("com1", params.getCommonParams()->uart) << bad;
        EXPECT_EQ(1400, params.getMaxTm()) << bad;
    }
}

}  // namespace
