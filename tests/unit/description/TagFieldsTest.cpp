// The fields of a tag's address.
#include <gtest/gtest.h>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Field {
    std::string name;
    std::string display;
    std::string preset;
    std::string group;
    std::string type;
    std::string sub;
};

const std::vector<Field> fields{
    {"nodeid", "Node ID", "", "network", "prop_nodeRef", "false"},
    {"memorytype", "Memory Type", "", "field", "prop_memRef", "false"},
    {"arrayindex.subindex", "Offset.SubIndex", "0", "field", "prop_subIndex", "true"},
    {"datatype", "Data Type", "boolean", "field", "prop_icomType", "true"},
};

TEST(TagFieldsTest, FieldsStandInTheOrderOfTheAddress) {
    std::vector<std::string> names;
    names.reserve(fields.size());
    for (const Field& field : fields)
        names.push_back(field.name);
    EXPECT_EQ(names, childTexts(root().child("tag_uri")));
}

TEST(TagFieldsTest, AttributesAreThoseOfTheFieldAndInOrder) {
    for (const Field& field : fields) {
        const auto element = childWithText(root().child("tag_uri"), field.name);
        EXPECT_STREQ("tag_field", element.name()) << field.name;
        EXPECT_EQ((Attributes{{"display", field.display},
                              {"default", field.preset},
                              {"arrayType", "false"},
                              {"readonly", "true"},
                              {"group", field.group},
                              {"type", field.type},
                              {"conversion", "true"},
                              {"sub", field.sub},
                              {"ExcludeOnlyIf", "false"},
                              {"isMandatory", "true"}}),
                  attributesOf(element))
            << field.name;
    }
}

}  // namespace
}  // namespace description_test
