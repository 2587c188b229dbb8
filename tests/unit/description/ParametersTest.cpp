// The parameters that a configuration tool offers.
#include <gtest/gtest.h>

#include <optional>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Parameter {
    std::string key;
    std::string display;
    std::string type;
    std::string preset;
    std::optional<std::string> defaultValue;
    bool ofNode;
    bool mandatory;
    bool distinct;
    std::string group;
    Attributes others;
    std::vector<std::string> choices;
};

const std::optional<std::string> absent;
const Attributes textList{{"listType", "prop_string"}};
const Attributes numberList{{"listType", "prop_integer"}};

// clang-format off
const std::vector<Parameter> parameters{
    {"CfgVer", "none", "prop_integer", "1", absent, false, true, false, "none", {}, {}},
    {"prefix", "Alias", "prop_string", "", "", true, false, true, "none", {}, {}},
    {"defNodeId", "Node ID", "prop_nodeRef", "1", absent, true, true, false, "none", {}, {}},
    {"timeout", "Timeout (ms)", "prop_integer", "2000", "2000", true, false, false, "none", {}, {}},
    {"delay", "Delay (ms)", "prop_integer", "0", "0", true, false, false, "none", {}, {}},
    {"repeat", "Num of repeats", "prop_integer", "2", "2", true, false, false, "none", {}, {}},
    {"maxOptLen", "Max read block", "prop_integer", "250", "250", true, false, false, "none",
     {{"spin", "0"}, {"min", "0"}, {"max", "250"}}, {}},
    {"maxBitOptLen", "Max read bit block", "prop_integer", "2000", "2000", true, false, false,
     "none", {}, {}},
    {"presetFunction", "Write Holding Register", "prop_list", "16", "16", true, false, false,
     "none", textList, {"06", "16"}},
    {"forceFunction", "Write Coils", "prop_list", "15", "15", true, false, false, "none", textList,
     {"05", "15"}},
    {"txMode", "Transmission Mode", "prop_list", "RTU", "RTU", false, false, false, "none",
     textList, {"RTU", "ASCII"}},
    {"uart", "Port", "prop_list", "com1", absent, false, true, false, "communications", textList,
     {"com1", "com2", "com3", "com4", "com5", "com6", "com7", "com8", "com9", "com10", "com11",
      "com12", "com13", "com14", "com15", "com16"}},
    {"baudrate", "Baudrate", "prop_list", "9600", absent, false, true, false, "communications",
     numberList,
     {"150", "300", "600", "1200", "2400", "4800", "9600", "19200", "38400", "57600", "115200"}},
    {"parity", "Parity", "prop_list", "even", absent, false, true, false, "communications",
     textList, {"none", "even", "odd"}},
    {"bits", "Data bits", "prop_list", "8", absent, false, true, false, "communications",
     {{"disable_list_id", "txMode"}, {"listType", "prop_integer"}, {"disable_list_entry", "0"}},
     {"7", "8"}},
    {"stopbits", "Stop bits", "prop_list", "1", absent, false, true, false, "communications",
     numberList, {"1", "2"}},
    {"mode", "Mode", "prop_list", "RS-485", absent, false, true, false, "communications", textList,
     {"RS-232", "RS-485", "RS-422"}},
    {"model", "Model", "prop_modelRef", "1", "1", true, false, false, "none", {}, {}},
};
// clang-format on

std::string word(bool value) {
    return value ? "true" : "false";
}

Attributes expectedAttributes(const Parameter& row) {
    Attributes attributes{{"display", row.display}, {"type", row.type}, {"default", row.preset}};
    if (row.defaultValue) attributes.emplace_back("defaultValue", *row.defaultValue);
    attributes.emplace_back("isNodeProperty", word(row.ofNode));
    attributes.emplace_back("isMandatory", word(row.mandatory));
    attributes.emplace_back("isDistinct", word(row.distinct));
    attributes.emplace_back("group", row.group);
    attributes.insert(attributes.end(), row.others.begin(), row.others.end());
    return attributes;
}

TEST(ParametersTest, KeysStandInOrder) {
    std::vector<std::string> keys;
    keys.reserve(parameters.size());
    for (const Parameter& row : parameters)
        keys.push_back(row.key);
    EXPECT_EQ(keys, childTexts(root().child("parameters")));
}

TEST(ParametersTest, AttributesAreThoseOfTheirKeysAndInOrder) {
    for (const Parameter& row : parameters) {
        const auto element = childWithText(root().child("parameters"), row.key);
        EXPECT_STREQ("parameter", element.name()) << row.key;
        EXPECT_EQ(expectedAttributes(row), attributesOf(element)) << row.key;
    }
}

TEST(ParametersTest, ChoicesAreListedInOrder) {
    for (const Parameter& row : parameters) {
        const auto element = childWithText(root().child("parameters"), row.key);
        EXPECT_EQ(row.choices, childTexts(element)) << row.key;
        for (const auto& entry : element.children("list_entry")) {
            EXPECT_TRUE(attributesOf(entry).empty()) << row.key;
        }
    }
}

TEST(ParametersTest, KeyStandsRightBehindTheOpeningTag) {
    for (const Parameter& row : parameters) {
        const auto element = childWithText(root().child("parameters"), row.key);
        EXPECT_TRUE(std::string_view(element.child_value()).starts_with(row.key)) << row.key;
    }
}

}  // namespace
}  // namespace description_test
