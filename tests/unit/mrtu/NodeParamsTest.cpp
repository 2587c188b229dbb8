// What the configuration text says of the nodes.
#include "tests/unit/mrtu/ParamTexts.h"

namespace {

using _MRTU::NodeParams;
using _MRTU::ParamManager;
using driver_test::messageFor;
using driver_test::messageForWhole;
using driver_test::parse;

TEST(NodeParamsTest, Defaults) {
    ParamManager params;
    ASSERT_EQ("", parse(params, ""));
    const NodeParams* node = params.getNodeParams(1);
    EXPECT_EQ("", node->prefix);
    EXPECT_EQ(1, node->defNodeId);
    EXPECT_EQ(2000, node->timeout);
    EXPECT_EQ(0, node->delay);
    EXPECT_EQ(2, node->repeat);
    EXPECT_EQ(250, node->maxOptLen);
    EXPECT_EQ(2000, node->maxBitOptLen);
    EXPECT_EQ("16", node->presetFunction);
    EXPECT_EQ("15", node->forceFunction);
    EXPECT_EQ("1", node->model);
    EXPECT_TRUE(node->oneBased);
}

TEST(NodeParamsTest, EveryKeyIsRead) {
    ParamManager params;
    ASSERT_EQ("", parse(params,
                        "prefix=a&nbsp;b defNodeId=7 timeout=300 delay=20 repeat=5 maxOptLen=100 "
                        "maxBitOptLen=64 presetFunction=06 forceFunction=05 model=4"));
    const NodeParams* node = params.getNodeParams(-1);
    EXPECT_EQ("a b", node->prefix);
    EXPECT_EQ(7, node->defNodeId);
    EXPECT_EQ(300, node->timeout);
    EXPECT_EQ(20, node->delay);
    EXPECT_EQ(5, node->repeat);
    EXPECT_EQ(100, node->maxOptLen);
    EXPECT_EQ(64, node->maxBitOptLen);
    EXPECT_EQ("06", node->presetFunction);
    EXPECT_EQ("05", node->forceFunction);
    EXPECT_EQ("4", node->model);
    EXPECT_FALSE(node->oneBased);
}

TEST(NodeParamsTest, IntegersHaveAutomaticBase) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=0x10 delay=010 repeat=12abc maxOptLen=abc"));
    const NodeParams* node = params.getNodeParams(-1);
    EXPECT_EQ(16, node->timeout);
    EXPECT_EQ(8, node->delay);
    EXPECT_EQ(12, node->repeat);
    EXPECT_EQ(0, node->maxOptLen);
}

TEST(NodeParamsTest, TimesAndRepeatsHaveNoRange) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=-5 delay=-6 repeat=-7 defNodeId=99999"));
    EXPECT_EQ(-5, params.getNodeParams(-1)->timeout);
    EXPECT_EQ(-6, params.getNodeParams(-1)->delay);
    EXPECT_EQ(-7, params.getNodeParams(-1)->repeat);
    EXPECT_EQ(99999, params.getNodeParams(-1)->defNodeId);
}

struct LimitCase {
    const char* items;
    const char* message;
    int maxOptLen;
    int maxBitOptLen;
};

TEST(NodeParamsTest, BlockLimitsAreLoweredOrRefused) {
    const LimitCase cases[] = {
        {"maxOptLen=250", "", 250, 2000},
        {"maxOptLen=251", "", 250, 2000},
        {"maxOptLen=300", "", 250, 2000},
        {"maxOptLen=0", "", 0, 2000},
        {"maxOptLen=-1", "parameter 'maxOptLen' out of range", 0, 0},
        {"maxBitOptLen=2000", "", 250, 2000},
        {"maxBitOptLen=2001", "", 250, 2000},
        {"maxBitOptLen=0", "", 250, 0},
        {"maxBitOptLen=-1", "parameter 'maxBitOptLen' out of range", 0, 0},
        {"maxOptLen=-1 maxBitOptLen=-1", "parameter 'maxOptLen' out of range", 0, 0},
        {"Node3::maxOptLen=-1", "parameter 'maxOptLen' out of range", 0, 0},
        {"Node3::maxBitOptLen=-9", "parameter 'maxBitOptLen' out of range", 0, 0},
    };
    for (const LimitCase& limit : cases) {
        ParamManager params;
        EXPECT_EQ(limit.message, parse(params, limit.items)) << limit.items;
        if (*limit.message != '\0') continue;
        EXPECT_EQ(limit.maxOptLen, params.getNodeParams(-1)->maxOptLen) << limit.items;
        EXPECT_EQ(limit.maxBitOptLen, params.getNodeParams(-1)->maxBitOptLen) << limit.items;
    }
}

TEST(NodeParamsTest, DefaultNodeIsRequired) {
    const std::string line =
        "CfgVer=1 uart=com1 baudrate=9600 parity=none bits=8 stopbits=1 mode=RS-232";
    EXPECT_EQ("Parser: parameter 'defNodeId' is not found", messageForWhole(line));
    EXPECT_EQ("Parser: parameter 'defNodeId' is not found",
              messageForWhole(line + " Node1::defNodeId=1"))
        << "the configuration-wide record comes first";
}

TEST(NodeParamsTest, PrefixBelongsToNodes) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "Node2::prefix=two Node3::timeout=5"));
    EXPECT_EQ("two", params.getNodeParams(2)->prefix);
    EXPECT_EQ("", params.getNodeParams(3)->prefix);
    EXPECT_EQ("Parser: parameter 'prefix' can't be node independent",
              messageFor("prefix=all Node2::timeout=5"));
    EXPECT_EQ("", messageFor("prefix=all"));
}

TEST(NodeParamsTest, PrefixIsReportedBeforeDefaultNode) {
    EXPECT_EQ("Parser: parameter 'prefix' can't be node independent",
              messageForWhole("CfgVer=1 prefix=x Node2::timeout=5"));
}

struct ModelCase {
    const char* items;
    bool wideOneBased;
    bool nodeOneBased;
};

/// Parsing only ever clears the flag, and a node's record begins as a copy of the wide one.
TEST(NodeParamsTest, OneBasedFlagIsInheritedAndNeverSet) {
    const ModelCase cases[] = {
        {"Node2::timeout=5", true, true},         {"model=1 Node2::model=2", true, false},
        {"model=1 Node2::model=3", true, true},   {"model=3 Node2::model=4", true, false},
        {"model=2 Node2::model=1", false, false}, {"model=4 Node2::model=3", false, false},
        {"model=x Node2::model=1", false, false}, {"model=01 Node2::model=1", false, false},
    };
    for (const ModelCase& model : cases) {
        ParamManager params;
        ASSERT_EQ("", parse(params, model.items)) << model.items;
        EXPECT_EQ(model.wideOneBased, params.getNodeParams(-1)->oneBased) << model.items;
        EXPECT_EQ(model.nodeOneBased, params.getNodeParams(2)->oneBased) << model.items;
    }
}

TEST(NodeParamsTest, NodesOwnValueThenCommonThenDefault) {
    ParamManager params;
    ASSERT_EQ("", parse(params, "timeout=700 Node2::timeout=90 Node2::delay=4 Node3::repeat=9"));
    EXPECT_EQ(90, params.getNodeParams(2)->timeout);
    EXPECT_EQ(4, params.getNodeParams(2)->delay);
    EXPECT_EQ(2, params.getNodeParams(2)->repeat);
    EXPECT_EQ(700, params.getNodeParams(3)->timeout);
    EXPECT_EQ(0, params.getNodeParams(3)->delay);
    EXPECT_EQ(9, params.getNodeParams(3)->repeat);
}

}  // namespace
