// The conversions that a configuration tool offers.
#include <gtest/gtest.h>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Conversion {
    std::string name;
    std::string display;
    std::string mask;
};

const std::vector<Conversion> conversions{
    {"bcd", "BCD", "0x7e07e"},
    {"swapnibble", "AB->BA", "0x3ffeffe"},
    {"swap2", "ABCD->CDAB", "0x3fecbec"},
    {"swap4", "ABCDEFGH->GHEFCDAB ", "0x3dc81c8"},
    {"swap8", "ABC...NOP->OPM...DAB", "0x3d00100"},
    {"inv", "Inv bits", "0x1471471"},
    {"neg", "Negate", "0x298e18e"},
};

TEST(DescribedConversionsTest, SectionHasItsDisplayText) {
    EXPECT_EQ((Attributes{{"display", "Conversions"}}), attributesOf(root().child("conversions")));
}

TEST(DescribedConversionsTest, NamesStandInOrder) {
    std::vector<std::string> names;
    names.reserve(conversions.size());
    for (const Conversion& conversion : conversions)
        names.push_back(conversion.name);
    EXPECT_EQ(names, childTexts(root().child("conversions")));
}

TEST(DescribedConversionsTest, AttributesAreThoseOfTheConversionAndInOrder) {
    for (const Conversion& conversion : conversions) {
        const auto element = childWithText(root().child("conversions"), conversion.name);
        EXPECT_STREQ("conversion", element.name()) << conversion.name;
        EXPECT_EQ((Attributes{{"display", conversion.display}, {"icomTypes", conversion.mask}}),
                  attributesOf(element))
            << conversion.name;
    }
}

}  // namespace
}  // namespace description_test
