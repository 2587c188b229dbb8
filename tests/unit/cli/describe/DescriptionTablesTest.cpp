// A description as tables and JSON.
#include "cli/describe/DescriptionTables.h"

#include <gtest/gtest.h>

#include "cli/describe/DescriptionJson.h"
#include "tests/unit/settings/DemoDocument.h"

namespace cli {
namespace {

using settings::parseDescription;
using settings_test::kDocument;
using values::Json;

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
