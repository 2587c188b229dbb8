// Documents turned into values. The document is this test's own.
#include "settings/DriverDescription.h"

#include <gtest/gtest.h>

#include "settings/TextError.h"
#include "tests/unit/settings/DemoDocument.h"

namespace settings {
namespace {

using settings_test::kDocument;

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
        EXPECT_THROW(parseDescription(text), DescriptionError) << text;
    }
}

}  // namespace
}  // namespace settings
