#include "values/TypeMask.h"

#include <gtest/gtest.h>

namespace values {
namespace {

TEST(TypeMaskTest, MasksAreSpelledOutOrByWhatTheyLack) {
    EXPECT_EQ("boolean, boolean-", typesText(0x1001));
    EXPECT_EQ("all but time, time-, object", typesText(0x3dff7ff));
    EXPECT_EQ("all", typesText(0x7ffffff));
    EXPECT_EQ("", typesText(0));
}

TEST(TypeMaskTest, ANameHasTheBitBelowItsTypesCode) {
    EXPECT_EQ(0x1U, typeMask("boolean"));
    EXPECT_EQ(0x1000U, typeMask("boolean-"));
    EXPECT_EQ(0x4000000U, typeMask("object"));
    EXPECT_EQ(0U, typeMask("string"));
}

}  // namespace
}  // namespace values
