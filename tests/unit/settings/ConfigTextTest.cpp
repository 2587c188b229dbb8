#include "settings/ConfigText.h"

#include <gtest/gtest.h>

#include "settings/TextError.h"

namespace {

using settings::itemOf;
using settings::withItems;

TEST(ConfigText, TheDefaultIsWhole) {
    const std::string text = settings::defaultConfig("3");
    EXPECT_TRUE(text.starts_with("CfgVer=1 "));
    EXPECT_EQ(itemOf(text, "defNodeId"), "1");
    EXPECT_EQ(itemOf(text, "model"), "3");
    EXPECT_EQ(itemOf(text, "txMode"), "RTU");
    EXPECT_EQ(itemOf(text, "uart"), "com1");
    EXPECT_EQ(itemOf(text, "baudrate"), "19200");
    EXPECT_EQ(itemOf(text, "parity"), "none");
    EXPECT_EQ(itemOf(text, "bits"), "8");
    EXPECT_EQ(itemOf(text, "stopbits"), "1");
    EXPECT_EQ(itemOf(text, "mode"), "RS-232");
}

TEST(ConfigText, AddedItemsWinOverThoseOfTheText) {
    const std::string text = withItems("old CfgVer=1 timeout=1 repeat=2", {{"timeout", "9"}});
    EXPECT_EQ(text, "old CfgVer=1 timeout=9  timeout=1 repeat=2");
    EXPECT_EQ(itemOf(text, "timeout"), "9");
    EXPECT_EQ(itemOf(text, "repeat"), "2");
}

TEST(ConfigText, BlanksInAddedValuesAreEncoded) {
    EXPECT_EQ(withItems("CfgVer=1", {{"Node1::prefix", "a b"}}),
              "CfgVer=1 Node1::prefix=a&nbsp;b ");
}

TEST(ConfigText, WithoutItsMarkerATextIsLeftAlone) {
    EXPECT_EQ(withItems("timeout=1", {{"timeout", "9"}}), "timeout=1");
}

TEST(ConfigText, ItemsAreWholeWordsBehindTheMarkerAndBeforeTheNext) {
    const std::string_view text = "uart=com9 CfgVer=1\n\txuart=com8\r\nuart=com2 CfgVer=2 mode=x";
    EXPECT_EQ(itemOf(text, "uart"), "com2");
    EXPECT_EQ(itemOf(text, "mode"), std::nullopt);
    EXPECT_EQ(itemOf("uart=com1", "uart"), std::nullopt);
    EXPECT_EQ(itemOf("CfgVer=1 prefix=", "prefix"), "");
}

TEST(ConfigText, NamesItsNodes) {
    EXPECT_EQ(
        settings::nodesOf("CfgVer=1 Node7::timeout=1 defNodeId=0x10 Node7::repeat=2 Node3::x=1 "
                          "NodeA::x=1 Node9=1"),
        (std::vector<int>{3, 7, 16}));
    EXPECT_EQ(settings::nodesOf("nothing"), std::vector<int>{});
}

TEST(ConfigText, ANodesModelIsItsOwnOrThatOfAll) {
    const std::string_view text = "CfgVer=1 model=2 Node4::model=3";
    EXPECT_EQ(settings::modelOf(text, 4), "3");
    EXPECT_EQ(settings::modelOf(text, 5), "2");
    EXPECT_EQ(settings::modelOf("CfgVer=1", 5), "1");
}

TEST(ConfigItem, IsSplitAtTheFirstEqualsSign) {
    const settings::ConfigItem item = settings::parseConfigItem("Node5::prefix=a =b");
    EXPECT_EQ(item.key, "Node5::prefix");
    EXPECT_EQ(item.value, "a =b");
}

TEST(ConfigItem, IsRefusedWhenItWouldNotSurviveTheText) {
    for (const char* const text : {"timeout", "=5", "time out=5", "a=b\nc=d", "a=b\tc", ""}) {
        EXPECT_THROW(settings::parseConfigItem(text), settings::TextError) << text;
    }
}

}  // namespace
