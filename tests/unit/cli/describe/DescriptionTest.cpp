// Documents turned into values, tables and JSON. The document is this test's own.
#include "cli/describe/Description.h"

#include <gtest/gtest.h>

#include "cli/ExitCode.h"
#include "cli/describe/DescriptionJson.h"
#include "cli/describe/DescriptionTables.h"

namespace cli {
namespace {

using values::Json;

const std::string kDocument = R"(<?xml version="1.0" encoding="utf-8"?>
<protocol_cfg>
    <name>DEMO</name>
    <display>A demonstration</display>
    <code>7</code>
    <empty a="b"/>
    <parameters>
        <parameter display="Pause" type="prop_integer" default="5" defaultValue="6" isNodeProperty="true" isMandatory="false" group="none" min="1" max="9">pause</parameter>
        <parameter display="Frames" type="prop_list" default="long" isMandatory="true" listType="prop_string">frames
            <list_entry>short</list_entry>
            <list_entry>long</list_entry>
        </parameter>
        <parameter display="Size" type="prop_list" default="2" isMandatory="true" disable_list_id="frames" listType="prop_integer" disable_list_entry="1">size
            <list_entry>2</list_entry>
        </parameter>
    </parameters>
    <memtypes>
        <memtype canBitWrite="true" display="Words" mustBitRead="false" blockReadCount="10" blockWriteCount="8" icomTypes="0x21" naturalType="unsignedShort" canBitArrayWrite="false" min="1" max="99" isReadOnly="false">W</memtype>
    </memtypes>
    <tag_uri>
        <tag_field display="Node" default="1">node</tag_field>
    </tag_uri>
    <models>
        <model display="The only one">A
            <memtype_ref min="0" max="98">W</memtype_ref>
        </model>
    </models>
    <conversions display="Conversions">
        <conversion display="AB->BA" icomTypes="0x7fffffe">swap</conversion>
    </conversions>
</protocol_cfg>
)";

TEST(Description, FactsAreTheElementsThatHoldATextAlone) {
    const Description description = parseDescription(kDocument);
    EXPECT_EQ(description.facts.size(), 3U);
    EXPECT_EQ(description.fact("display"), "A demonstration");
    EXPECT_EQ(description.fact("empty"), "");
    EXPECT_EQ(description.fact("nothing"), "");
}

TEST(Description, ParametersHaveWhatTheirElementsSay) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* pause = description.parameter("pause");
    ASSERT_NE(pause, nullptr);
    EXPECT_EQ(pause->display, "Pause");
    EXPECT_EQ(pause->preset, "5");
    EXPECT_EQ(pause->defaultValue, "6");
    EXPECT_TRUE(pause->ofNode);
    EXPECT_FALSE(pause->mandatory);
    EXPECT_EQ(pause->min, 1);
    EXPECT_EQ(pause->max, 9);
    EXPECT_TRUE(pause->isNumber());
    EXPECT_EQ(description.parameter("Pause"), nullptr) << "names are exact";
}

TEST(Description, KeyOfAListIsFoundInFrontOfItsChoices) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* frames = description.parameter("frames");
    ASSERT_NE(frames, nullptr);
    EXPECT_EQ(frames->choices, (std::vector<std::string>{"short", "long"}));
    EXPECT_FALSE(frames->isNumber());
    EXPECT_FALSE(frames->defaultValue.has_value());
}

TEST(Description, DisablingEntryIsResolvedToItsValue) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* size = description.parameter("size");
    ASSERT_NE(size, nullptr);
    EXPECT_EQ(size->disabledBy, "frames");
    EXPECT_EQ(size->disablingValue, "long");
}

TEST(Description, AreasModelsAndConversionsHaveWhatTheirElementsSay) {
    const Description description = parseDescription(kDocument);
    const AreaInfo* area = description.area("W");
    ASSERT_NE(area, nullptr);
    EXPECT_EQ(area->types, 0x21U);
    EXPECT_EQ(area->naturalType, "unsignedShort");
    EXPECT_TRUE(area->bitWrite);
    EXPECT_EQ(area->readCount, 10);
    EXPECT_EQ(area->max, 99);
    const ModelInfo* model = description.model("A");
    ASSERT_NE(model, nullptr);
    ASSERT_EQ(model->offers.size(), 1U);
    EXPECT_EQ(model->offers[0].max, 98);
    ASSERT_NE(description.conversion("swap"), nullptr);
    EXPECT_EQ(description.conversion("swap")->display, "AB->BA");
}

TEST(Description, MalformedAndForeignDocumentsAreRefused) {
    for (const char* text : {"", "<protocol_cfg>", "<other/>", "no xml"}) {
        EXPECT_THROW(parseDescription(text), CommandError) << text;
    }
}

TEST(DescriptionTables, ParametersShowDefaultsAndChoices) {
    EXPECT_EQ(parametersText(parseDescription(kDocument)),
              "KEY     MEANING  GIVEN FOR    DEFAULT   SUGGESTED  VALUES\n"
              "pause   Pause    node or all  6         5          1..9\n"
              "frames  Frames   all          required  long       short, long\n"
              "size    Size     all          required  2          2; not with frames=long\n");
}

TEST(DescriptionTables, ModelsShowTheirAddresses) {
    EXPECT_EQ(modelsText(parseDescription(kDocument)),
              "model A: The only one\n"
              "  AREA  ADDRESSES  MEANING\n"
              "  W     0..98      Words\n");
}

TEST(DescriptionTables, MasksAreSpelledOutOrByWhatTheyLack) {
    EXPECT_EQ(typesText(0x1001), "boolean, boolean-");
    EXPECT_EQ(typesText(0x3dff7ff), "all but time, time-, object");
    EXPECT_EQ(typesText(0x7ffffff), "all");
    EXPECT_EQ(typesText(0), "");
}

TEST(DescriptionJson, LeavesOutWhatAParameterDoesNotHave) {
    const Json json = parametersJson(parseDescription(kDocument));
    ASSERT_EQ(json.size(), 3U);
    EXPECT_EQ(json[0]["default"], "6");
    EXPECT_EQ(json[0]["max"], 9);
    EXPECT_FALSE(json[0].contains("choices"));
    EXPECT_FALSE(json[1].contains("default"));
    EXPECT_EQ(json[2]["notWith"]["value"], "long");
}

TEST(DescriptionJson, DataTypesAreNames) {
    const Json json = memoryJson(parseDescription(kDocument));
    EXPECT_EQ(json[0]["types"], (Json{"boolean", "unsignedShort"}));
}

}  // namespace
}  // namespace cli
