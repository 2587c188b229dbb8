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

TEST(DescriptionConversions, SectionHasItsDisplayText) {
    EXPECT_EQ(attributesOf(root().child("conversions")), (Attributes{{"display", "Conversions"}}));
}

TEST(DescriptionConversions, NamesStandInOrder) {
    std::vector<std::string> names;
    names.reserve(conversions.size());
    for (const Conversion& conversion : conversions)
        names.push_back(conversion.name);
    EXPECT_EQ(childTexts(root().child("conversions")), names);
}

TEST(DescriptionConversions, AttributesAreThoseOfTheConversionAndInOrder) {
    for (const Conversion& conversion : conversions) {
        const auto element = childWithText(root().child("conversions"), conversion.name);
        EXPECT_STREQ(element.name(), "conversion") << conversion.name;
        EXPECT_EQ(attributesOf(element),
                  (Attributes{{"display", conversion.display}, {"icomTypes", conversion.mask}}))
            << conversion.name;
    }
}

}  // namespace
}  // namespace description_test
