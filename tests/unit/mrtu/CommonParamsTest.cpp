// What the configuration text says of the line.
#include "tests/unit/mrtu/ParamTexts.h"

namespace {

using _MRTU::CommonParams;
using _MRTU::ParamManager;
using driver_test::messageFor;
using driver_test::messageForWhole;
using driver_test::parse;

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

}  // namespace
