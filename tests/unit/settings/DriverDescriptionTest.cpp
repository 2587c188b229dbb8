// Documents turned into values. The document is this test's own.
#include "settings/DriverDescription.h"

#include <gtest/gtest.h>

#include "settings/TextError.h"
#include "tests/unit/settings/DemoDocument.h"

namespace settings {
namespace {

using settings_test::kDocument;

TEST(DriverDescriptionTest, FactsAreTheElementsThatHoldATextAlone) {
    const Description description = parseDescription(kDocument);
    EXPECT_EQ(3U, description.facts.size());
    EXPECT_EQ("A demonstration", description.fact("display"));
    EXPECT_EQ("", description.fact("empty"));
    EXPECT_EQ("", description.fact("nothing"));
}

TEST(DriverDescriptionTest, ParametersHaveWhatTheirElementsSay) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* pause = description.parameter("pause");
    ASSERT_NE(pause, nullptr);
    EXPECT_EQ("Pause", pause->display);
    EXPECT_EQ("5", pause->preset);
    EXPECT_EQ("6", pause->defaultValue);
    EXPECT_TRUE(pause->ofNode);
    EXPECT_FALSE(pause->mandatory);
    EXPECT_EQ(1, pause->min);
    EXPECT_EQ(9, pause->max);
    EXPECT_TRUE(pause->isNumber());
    EXPECT_EQ(nullptr, description.parameter("Pause")) << "names are exact";
}

TEST(DriverDescriptionTest, KeyOfAListIsFoundInFrontOfItsChoices) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* frames = description.parameter("frames");
    ASSERT_NE(frames, nullptr);
    EXPECT_EQ((std::vector<std::string>{"short", "long"}), frames->choices);
    EXPECT_FALSE(frames->isNumber());
    EXPECT_FALSE(frames->defaultValue.has_value());
}

TEST(DriverDescriptionTest, DisablingEntryIsResolvedToItsValue) {
    const Description description = parseDescription(kDocument);
    const ParameterInfo* size = description.parameter("size");
    ASSERT_NE(size, nullptr);
    EXPECT_EQ("frames", size->disabledBy);
    EXPECT_EQ("long", size->disablingValue);
}

TEST(DriverDescriptionTest, AreasModelsAndConversionsHaveWhatTheirElementsSay) {
    const Description description = parseDescription(kDocument);
    const AreaInfo* area = description.area("W");
    ASSERT_NE(area, nullptr);
    EXPECT_EQ(0x21U, area->types);
    EXPECT_EQ("unsignedShort", area->naturalType);
    EXPECT_TRUE(area->bitWrite);
    EXPECT_EQ(10, area->readCount);
    EXPECT_EQ(99, area->max);
    const ModelInfo* model = description.model("A");
    ASSERT_NE(model, nullptr);
    ASSERT_EQ(1U, model->offers.size());
    EXPECT_EQ(98, model->offers[0].max);
    ASSERT_NE(description.conversion("swap"), nullptr);
    EXPECT_EQ("AB->BA", description.conversion("swap")->display);
}

TEST(DriverDescriptionTest, MalformedAndForeignDocumentsAreRefused) {
    for (const char* text : {"", "<protocol_cfg>", "<other/>", "no xml"}) {
        EXPECT_THROW(parseDescription(text), DescriptionError) << text;
    }
}

}  // namespace
}  // namespace settings
