// What the configuration text says.
#include "mrtu/Params.h"

#include <gtest/gtest.h>

#include <climits>

namespace {

using _MRTU::CommonParams;
using _MRTU::NodeParams;
using _MRTU::ParamManager;

const std::string kLine =
    " uart=com1 baudrate=9600 parity=none bits=8 stopbits=1 mode=RS-232 defNodeId=1";

/// Parses items in front of a complete line configuration; "" on success, else the message.
std::string parse(ParamManager& params, const std::string& items) {
    return params.parse(("CfgVer=1 " + items + kLine).c_str()) ? "" : params.getLastError();
}

std::string messageFor(const std::string& items) {
    ParamManager params;
    return parse(params, items);
}

/// The message for a text that stands alone.
std::string messageForWhole(const std::string& text) {
    ParamManager params;
    return params.parse(text.c_str()) ? "" : params.getLastError();
}

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

TEST(CommonParamsTest, EveryKeyIsRead) {
    ParamManager params;
    ASSERT_EQ("", parse(params,
                        "txMode=ASCII uart=com7 baudrate=0x4B00 parity=Even bits=7 stopbits=2 "
                        "mode=RS-422"));
    const CommonParams* common = params.getCommonParams();
    EXPECT_EQ("ASCII", common->txMode);
    EXPECT_TRUE(common->isAscii());
    EXPECT_EQ("com7", common->uart);
    EXPECT_EQ(19200, common->baudrate);
    EXPECT_EQ("Even", common->parity);
    EXPECT_EQ(7, common->bits);
    EXPECT_EQ(2, common->stopbits);
    EXPECT_EQ("RS-422", common->mode);
}

TEST(CommonParamsTest, OnlyTheExactTextSelectsAscii) {
    for (const char* mode : {"ascii", "Ascii", "ASCII8", "RTU", "rtu"}) {
        ParamManager params;
        ASSERT_EQ("", parse(params, std::string("txMode=") + mode));
        EXPECT_FALSE(params.getCommonParams()->isAscii()) << mode;
    }
}

std::string without(const std::string& key) {
    std::string text = "CfgVer=1 ";
    for (const char* item : {"defNodeId=1", "uart=com1", "baudrate=9600", "parity=none", "bits=8",
                             "stopbits=1", "mode=RS-232"})
        if (!std::string(item).starts_with(key + "=")) text += std::string(item) + " ";
    return text;
}

TEST(CommonParamsTest, RequiredKeys) {
    for (const char* key : {"uart", "baudrate", "parity", "stopbits", "mode"})
        EXPECT_EQ("Parser: parameter '" + std::string(key) + "' is not found",
                  messageForWhole(without(key)));
}

TEST(CommonParamsTest, FirstMissingKeyIsReported) {
    const char* const keys[] = {"defNodeId", "uart",     "baudrate", "parity",
                                "bits",      "stopbits", "mode"};
    std::string text = "CfgVer=1 ";
    for (const char* key : keys) {
        EXPECT_EQ("Parser: parameter '" + std::string(key) + "' is not found",
                  messageForWhole(text));
        text += std::string(key) + "=1 ";
    }
    EXPECT_EQ("", messageForWhole(text));
}

TEST(CommonParamsTest, DataBitsAreOptionalOnlyBehindAnExplicitRtu) {
    const std::string text = without("bits");
    EXPECT_EQ("", messageForWhole(text + "txMode=RTU"));
    for (const char* mode : {"", "txMode=ASCII", "txMode=rtu", "txMode=RTU8"})
        EXPECT_EQ("Parser: parameter 'bits' is not found", messageForWhole(text + mode)) << mode;
}

/// A prefixed item of the line is an item of its own name: nobody who asks for the line sees it.
TEST(CommonParamsTest, PrefixedLineParametersAreNotSeen) {
    EXPECT_EQ("Parser: parameter 'uart' is not found",
              messageForWhole(without("uart") + "Node2::uart=com2"));
    EXPECT_EQ("", messageFor("Node2::uart=com2"));
}

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
