// What the driver is and can do: the elements in front of the parameters.
#include <gtest/gtest.h>

#include <array>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Fact {
    std::string_view element;
    std::string_view value;
};

constexpr std::array facts{
    Fact{"usesUart", "true"},
    Fact{"usesEthernet", "false"},
    Fact{"usesNetwork", "true"},
    Fact{"usesDatagram", "false"},
    Fact{"canWriteDatagram", "false"},
    Fact{"canMultipleRead", "false"},
    Fact{"canMultipleWrite", "false"},
    Fact{"usesTags", "false"},
    Fact{"isReentrant", "true"},
    Fact{"isConverted", "false"},
    Fact{"isProtgen", "true"},
    Fact{"usesTask", "false"},
    Fact{"usesSemaphore", "true"},
    Fact{"usesDoCommand", "true"},
    Fact{"usesExtend", "false"},
    Fact{"inheritsProtgen", "true"},
    Fact{"usesOfflineOpt", "true"},
    Fact{"name", "MRTU"},
    Fact{"display", "Modbus RTU"},
    Fact{"compatibilityCode", "7"},
    Fact{"displayDlgTitle", "Modbus RTU"},
    Fact{"VCS", "exclusive"},
    Fact{"arrayItem", "protgen-default"},
    Fact{"protGenVer", "214"},
    Fact{"code", "184"},
    Fact{"maxDisplayRows", "14"},
    Fact{"defaultOrt", "30000"},
    Fact{"minimumOrt", "1000"},
    Fact{"defaultRpt", "3"},
    Fact{"plcnet", ""},
};

TEST(IdentityTest, RootIsTheProtocolConfiguration) {
    EXPECT_STREQ("protocol_cfg", root().name());
    EXPECT_TRUE(attributesOf(root()).empty());
}

TEST(IdentityTest, FactsStandInOrderWithTheirValues) {
    pugi::xml_node element = root().first_child();
    for (const Fact& fact : facts) {
        EXPECT_EQ(fact.element, element.name());
        EXPECT_EQ(fact.value, element.child_value()) << fact.element;
        element = element.next_sibling();
    }
}

TEST(IdentityTest, SectionsFollowTheFactsInOrder) {
    std::vector<std::string> names;
    for (const pugi::xml_node& child : root().children())
        names.emplace_back(child.name());
    ASSERT_GE(names.size(), facts.size());
    names.erase(names.begin(), names.begin() + facts.size());
    EXPECT_EQ(
        (std::vector<std::string>{"parameters", "memtypes", "tag_uri", "models", "conversions"}),
        names);
}

TEST(IdentityTest, NodesAreLocatedByTheirSlaveNumber) {
    EXPECT_EQ((Attributes{{"alwaysEnable", "false"}, {"locator", "slaveid"}}),
              attributesOf(root().child("plcnet")));
}

}  // namespace
}  // namespace description_test
