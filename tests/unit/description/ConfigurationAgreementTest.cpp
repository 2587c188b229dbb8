// The description against the configuration reader: keys, defaults, choices and limits.
#include <gtest/gtest.h>

#include <functional>
#include <map>

#include "mrtu/LineSettings.h"
#include "mrtu/Params.h"
#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

using _MRTU::NodeParams;
using _MRTU::ParamManager;

using Items = std::map<std::string, std::string>;

constexpr int node = 7;
constexpr const char* nodePrefix = "Node7::";

/// What the reader stores for each key; `number` is the node that is asked for.
const std::map<std::string, std::function<std::string(const ParamManager&, int number)>> stored{
    {"prefix", [](const auto& m, int n) { return m.getNodeParams(n)->prefix; }},
    {"defNodeId",
     [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->defNodeId); }},
    {"timeout", [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->timeout); }},
    {"delay", [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->delay); }},
    {"repeat", [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->repeat); }},
    {"maxOptLen",
     [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->maxOptLen); }},
    {"maxBitOptLen",
     [](const auto& m, int n) { return std::to_string(m.getNodeParams(n)->maxBitOptLen); }},
    {"presetFunction", [](const auto& m, int n) { return m.getNodeParams(n)->presetFunction; }},
    {"forceFunction", [](const auto& m, int n) { return m.getNodeParams(n)->forceFunction; }},
    {"model", [](const auto& m, int n) { return m.getNodeParams(n)->model; }},
    {"txMode", [](const auto& m, int) { return m.getCommonParams()->txMode; }},
    {"uart", [](const auto& m, int) { return m.getCommonParams()->uart; }},
    {"baudrate", [](const auto& m, int) { return std::to_string(m.getCommonParams()->baudrate); }},
    {"parity", [](const auto& m, int) { return m.getCommonParams()->parity; }},
    {"bits", [](const auto& m, int) { return std::to_string(m.getCommonParams()->bits); }},
    {"stopbits", [](const auto& m, int) { return std::to_string(m.getCommonParams()->stopbits); }},
    {"mode", [](const auto& m, int) { return m.getCommonParams()->mode; }},
};

pugi::xml_node described(const std::string& key) {
    return childWithText(root().child("parameters"), key);
}

bool flag(const pugi::xml_node& parameter, const char* name) {
    return parameter.attribute(name).as_bool();
}

/// The described parameters but for the version marker, which is the format, not a parameter.
std::vector<pugi::xml_node> configurable() {
    std::vector<pugi::xml_node> parameters;
    for (const auto& parameter : root().child("parameters").children("parameter")) {
        if (textOf(parameter) != "CfgVer") parameters.push_back(parameter);
    }
    return parameters;
}

std::string configuration(const Items& items) {
    std::string text = "CfgVer=1";
    for (const auto& [key, value] : items)
        text.append(" ").append(key).append("=").append(value);
    return text;
}

/// What a tool writes that fills in the mandatory parameters only.
Items mandatoryDefaults() {
    Items items;
    for (const auto& parameter : configurable()) {
        if (flag(parameter, "isMandatory")) {
            items[textOf(parameter)] = parameter.attribute("default").value();
        }
    }
    return items;
}

TEST(ConfigurationAgreementTest, KnowTheSameKeys) {
    std::map<std::string, int> keys;
    for (const auto& parameter : configurable())
        ++keys[textOf(parameter)];
    EXPECT_EQ(keys.size(), stored.size());
    for (const auto& [key, read] : stored)
        EXPECT_EQ(1, keys[key]) << key;
}

TEST(ConfigurationAgreementTest, VersionIsTheMarkerOfTheFormat) {
    const std::string body =
        configuration(mandatoryDefaults()).substr(std::string("CfgVer=1").size());
    const std::string marker =
        std::string("CfgVer=") + described("CfgVer").attribute("default").value();
    EXPECT_TRUE(ParamManager().parse((marker + body).c_str()));
    EXPECT_FALSE(ParamManager().parse(body.c_str()));
}

TEST(ConfigurationAgreementTest, MandatoryKeysAloneMakeAConfiguration) {
    ParamManager manager;
    EXPECT_TRUE(manager.parse(configuration(mandatoryDefaults()).c_str()))
        << manager.getLastError();
}

TEST(ConfigurationAgreementTest, EveryMandatoryKeyIsMissedByTheReader) {
    for (const auto& [key, value] : mandatoryDefaults()) {
        Items items = mandatoryDefaults();
        items.erase(key);
        ParamManager manager;
        EXPECT_FALSE(manager.parse(configuration(items).c_str())) << key;
        EXPECT_EQ("Parser: parameter '" + key + "' is not found", manager.getLastError());
    }
}

TEST(ConfigurationAgreementTest, DefaultOfEveryOptionalKeyIsTheReadersDefault) {
    ParamManager manager;
    ASSERT_TRUE(manager.parse(configuration(mandatoryDefaults()).c_str()));
    int compared = 0;
    for (const auto& parameter : configurable()) {
        if (flag(parameter, "isMandatory")) continue;
        const std::string key = textOf(parameter);
        EXPECT_EQ(stored.at(key)(manager, -1), parameter.attribute("defaultValue").value()) << key;
        EXPECT_STREQ(parameter.attribute("default").value(),
                     parameter.attribute("defaultValue").value())
            << key;
        ++compared;
    }
    EXPECT_EQ(10, compared);
}

TEST(ConfigurationAgreementTest, EveryDefaultIsAmongTheChoices) {
    for (const auto& parameter : configurable()) {
        if (parameter.child("list_entry").empty()) continue;
        EXPECT_FALSE(childWithText(parameter, parameter.attribute("default").value()).empty())
            << textOf(parameter);
    }
}

TEST(ConfigurationAgreementTest, EveryChoiceIsReadAsWritten) {
    int compared = 0;
    for (const auto& parameter : configurable()) {
        const std::string key = textOf(parameter);
        for (const std::string& choice : childTexts(parameter)) {
            Items items = mandatoryDefaults();
            items["txMode"] = "ASCII";  // RTU does not read "bits".
            items[key] = choice;
            ParamManager manager;
            ASSERT_TRUE(manager.parse(configuration(items).c_str())) << key << "=" << choice;
            EXPECT_EQ(choice, stored.at(key)(manager, -1)) << key;
            ++compared;
        }
    }
    EXPECT_EQ(2 + 2 + 2 + 16 + 11 + 3 + 2 + 2 + 3, compared);
}

TEST(ConfigurationAgreementTest, EveryChoiceOfLineSettingsHasACode) {
    for (const std::string& parity : childTexts(described("parity"))) {
        EXPECT_GE(_MRTU::parityCode(parity), 0) << parity;
    }
    for (const std::string& mode : childTexts(described("mode"))) {
        EXPECT_GE(_MRTU::modeCode(mode), 0) << mode;
    }
    for (const std::string& baud : childTexts(described("baudrate"))) {
        EXPECT_TRUE(_MRTU::isListedBaudRate(std::stoi(baud))) << baud;
    }
}

/// A value that differs from the default.
std::string anotherValue(const std::string& key, const pugi::xml_node& parameter) {
    const std::string preset = parameter.attribute("default").value();
    for (const std::string& choice : childTexts(parameter)) {
        if (choice != preset) return choice;
    }
    return key == "model" ? "3" : "42";
}

TEST(ConfigurationAgreementTest, NodePropertiesMayBeGivenForOneNode) {
    int compared = 0;
    for (const auto& parameter : configurable()) {
        if (!flag(parameter, "isNodeProperty")) continue;
        const std::string key = textOf(parameter);
        const std::string value = anotherValue(key, parameter);
        Items items = mandatoryDefaults();
        items[nodePrefix + key] = value;
        ParamManager manager;
        ASSERT_TRUE(manager.parse(configuration(items).c_str())) << key;
        EXPECT_EQ(value, stored.at(key)(manager, node)) << key;
        EXPECT_NE(stored.at(key)(manager, -1), value) << key << " leaks to other nodes";
        ++compared;
    }
    EXPECT_EQ(10, compared);
}

TEST(ConfigurationAgreementTest, OtherPropertiesOfOneNodeAreNotSeen) {
    int compared = 0;
    for (const auto& parameter : configurable()) {
        if (flag(parameter, "isNodeProperty")) continue;
        const std::string key = textOf(parameter);
        const std::string value = anotherValue(key, parameter);
        Items items = mandatoryDefaults();
        items["txMode"] = "ASCII";
        items.erase(key);
        items[nodePrefix + key] = value;
        ParamManager manager;
        const bool accepted = manager.parse(configuration(items).c_str());
        EXPECT_EQ(!flag(parameter, "isMandatory"), accepted) << key;
        EXPECT_NE(stored.at(key)(manager, node), value) << key;
        ++compared;
    }
    EXPECT_EQ(7, compared);
}

TEST(ConfigurationAgreementTest, DistinctParameterHasNoCommonValueWhereThereAreNodes) {
    for (const auto& parameter : configurable()) {
        const std::string key = textOf(parameter);
        Items items = mandatoryDefaults();
        items[key] = anotherValue(key, parameter);
        items[nodePrefix + std::string("delay")] = "1";
        EXPECT_EQ(!flag(parameter, "isDistinct"),
                  ParamManager().parse(configuration(items).c_str()))
            << key;
    }
}

TEST(ConfigurationAgreementTest, LimitsOfTheRegisterBlockAreTheReadersLimits) {
    const auto parameter = described("maxOptLen");
    const int min = parameter.attribute("min").as_int(-1);
    const int max = parameter.attribute("max").as_int(-1);
    Items items = mandatoryDefaults();

    items["maxOptLen"] = std::to_string(max + 1);
    ParamManager manager;
    ASSERT_TRUE(manager.parse(configuration(items).c_str()));
    EXPECT_EQ(max, manager.getNodeParams(-1)->maxOptLen);

    items["maxOptLen"] = std::to_string(min);
    ASSERT_TRUE(manager.parse(configuration(items).c_str()));
    EXPECT_EQ(min, manager.getNodeParams(-1)->maxOptLen);

    items["maxOptLen"] = std::to_string(min - 1);
    EXPECT_FALSE(manager.parse(configuration(items).c_str()));
}

TEST(ConfigurationAgreementTest, DefaultModelIsADescribedModel) {
    const std::string preset = described("model").attribute("default").value();
    EXPECT_FALSE(childWithText(root().child("models"), preset).empty());
}

// The listed differences.

TEST(ConfigurationAgreementTest, MarkParityIsAcceptedThoughNotOffered) {
    EXPECT_TRUE(childWithText(described("parity"), "mark").empty());
    EXPECT_EQ(3, _MRTU::parityCode("mark"));
    EXPECT_EQ(-1, _MRTU::parityCode("space")) << "no further difference";
}

TEST(ConfigurationAgreementTest, DataBitsAreMandatoryYetNotReadInRtu) {
    const auto bits = described("bits");
    ASSERT_TRUE(flag(bits, "isMandatory"));
    const std::vector<std::string> modes =
        childTexts(described(bits.attribute("disable_list_id").value()));
    EXPECT_EQ("RTU", modes.at(bits.attribute("disable_list_entry").as_uint(99)));

    for (const std::string& mode : modes) {
        Items items = mandatoryDefaults();
        items["txMode"] = mode;
        items.erase("bits");
        EXPECT_EQ(mode == "RTU", ParamManager().parse(configuration(items).c_str())) << mode;
    }
}

TEST(ConfigurationAgreementTest, DataBitsGivenInRtuAreNotStored) {
    Items items = mandatoryDefaults();
    items["txMode"] = "RTU";
    items["bits"] = "7";
    ParamManager manager;
    ASSERT_TRUE(manager.parse(configuration(items).c_str()));
    EXPECT_NE(manager.getCommonParams()->bits, 7);
    EXPECT_TRUE(manager.getCommonParams()->isRtu());
}

}  // namespace
}  // namespace description_test
