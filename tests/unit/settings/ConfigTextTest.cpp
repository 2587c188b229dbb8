#include "settings/ConfigText.h"

#include <gtest/gtest.h>

#include "settings/TextError.h"

namespace {

using settings::itemOf;
using settings::withItems;

TEST(ConfigTextTest, TheDefaultIsWhole) {
    const std::string text = settings::defaultConfig("3");
    EXPECT_TRUE(text.starts_with("CfgVer=1 "));
    EXPECT_EQ("1", itemOf(text, "defNodeId"));
    EXPECT_EQ("3", itemOf(text, "model"));
    EXPECT_EQ("RTU", itemOf(text, "txMode"));
    EXPECT_EQ("com1", itemOf(text, "uart"));
    EXPECT_EQ("19200", itemOf(text, "baudrate"));
    EXPECT_EQ("none", itemOf(text, "parity"));
    EXPECT_EQ("8", itemOf(text, "bits"));
    EXPECT_EQ("1", itemOf(text, "stopbits"));
    EXPECT_EQ("RS-232", itemOf(text, "mode"));
}

TEST(ConfigTextTest, AddedItemsWinOverThoseOfTheText) {
    const std::string text = withItems("old CfgVer=1 timeout=1 repeat=2", {{"timeout", "9"}});
    EXPECT_EQ("old CfgVer=1 timeout=9  timeout=1 repeat=2", text);
    EXPECT_EQ("9", itemOf(text, "timeout"));
    EXPECT_EQ("2", itemOf(text, "repeat"));
}

TEST(ConfigTextTest, BlanksInAddedValuesAreEncoded) {
    EXPECT_EQ("CfgVer=1 Node1::prefix=a&nbsp;b ",
              withItems("CfgVer=1", {{"Node1::prefix", "a b"}}));
}

TEST(ConfigTextTest, WithoutItsMarkerATextIsLeftAlone) {
    EXPECT_EQ("timeout=1", withItems("timeout=1", {{"timeout", "9"}}));
}

TEST(ConfigTextTest, ItemsAreWholeWordsBehindTheMarkerAndBeforeTheNext) {
    const std::string_view text = "uart=com9 CfgVer=1\n\txuart=com8\r\nuart=com2 CfgVer=2 mode=x";
    EXPECT_EQ("com2", itemOf(text, "uart"));
    EXPECT_EQ(std::nullopt, itemOf(text, "mode"));
    EXPECT_EQ(std::nullopt, itemOf("uart=com1", "uart"));
    EXPECT_EQ("", itemOf("CfgVer=1 prefix=", "prefix"));
}

TEST(ConfigTextTest, NamesItsNodes) {
    EXPECT_EQ(
        (std::vector<int>{3, 7, 16}),
        settings::nodesOf("CfgVer=1 Node7::timeout=1 defNodeId=0x10 Node7::repeat=2 Node3::x=1 "
                          "NodeA::x=1 Node9=1"));
    EXPECT_EQ(std::vector<int>{}, settings::nodesOf("nothing"));
}

TEST(ConfigTextTest, ANodesModelIsItsOwnOrThatOfAll) {
    const std::string_view text = "CfgVer=1 model=2 Node4::model=3";
    EXPECT_EQ("3", settings::modelOf(text, 4));
    EXPECT_EQ("2", settings::modelOf(text, 5));
    EXPECT_EQ("1", settings::modelOf("CfgVer=1", 5));
}

TEST(ConfigTextTest, ConfigItemIsSplitAtTheFirstEqualsSign) {
    const settings::ConfigItem item = settings::parseConfigItem("Node5::prefix=a =b");
    EXPECT_EQ("Node5::prefix", item.key);
    EXPECT_EQ("a =b", item.value);
}

TEST(ConfigTextTest, ConfigItemIsRefusedWhenItWouldNotSurviveTheText) {
    for (const char* const text : {"timeout", "=5", "time out=5", "a=b\nc=d", "a=b\tc", ""}) {
        EXPECT_THROW(settings::parseConfigItem(text), settings::TextError) << text;
    }
}

}  // namespace
