#include "values/TypeMask.h"

#include <gtest/gtest.h>

namespace values {
namespace {

TEST(TypeMask, MasksAreSpelledOutOrByWhatTheyLack) {
    EXPECT_EQ(typesText(0x1001), "boolean, boolean-");
    EXPECT_EQ(typesText(0x3dff7ff), "all but time, time-, object");
    EXPECT_EQ(typesText(0x7ffffff), "all");
    EXPECT_EQ(typesText(0), "");
}

TEST(TypeMask, ANameHasTheBitBelowItsTypesCode) {
    EXPECT_EQ(0x1U, typeMask("boolean"));
    EXPECT_EQ(0x1000U, typeMask("boolean-"));
    EXPECT_EQ(0x4000000U, typeMask("object"));
    EXPECT_EQ(0U, typeMask("string"));
}

}  // namespace
}  // namespace values
