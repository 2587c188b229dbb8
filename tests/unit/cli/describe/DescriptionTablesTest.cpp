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

TEST(DescriptionTablesTest, ParametersShowDefaultsAndChoices) {
    EXPECT_EQ(
        "KEY     MEANING  GIVEN FOR    DEFAULT   SUGGESTED  VALUES\n"
        "pause   Pause    node or all  6         5          1..9\n"
        "frames  Frames   all          required  long       short, long\n"
        "size    Size     all          required  2          2; not with frames=long\n",
        parametersText(parseDescription(kDocument)));
}

TEST(DescriptionTablesTest, ModelsShowTheirAddresses) {
    EXPECT_EQ(
        "model A: The only one\n"
        "  AREA  ADDRESSES  MEANING\n"
        "  W     0..98      Words\n",
        modelsText(parseDescription(kDocument)));
}

TEST(DescriptionTablesTest, JsonLeavesOutWhatAParameterDoesNotHave) {
    const Json json = parametersJson(parseDescription(kDocument));
    ASSERT_EQ(3U, json.size());
    EXPECT_EQ("6", json[0]["default"]);
    EXPECT_EQ(9, json[0]["max"]);
    EXPECT_FALSE(json[0].contains("choices"));
    EXPECT_FALSE(json[1].contains("default"));
    EXPECT_EQ("long", json[2]["notWith"]["value"]);
}

TEST(DescriptionTablesTest, JsonDataTypesAreNames) {
    const Json json = memoryJson(parseDescription(kDocument));
    EXPECT_EQ((Json{"boolean", "unsignedShort"}), json[0]["types"]);
}

}  // namespace
}  // namespace cli
