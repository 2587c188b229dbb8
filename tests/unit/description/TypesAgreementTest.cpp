// The data types of the driver family's framework against those by which values are written: who
// adds a type on one side of dlopen() and not on the other sees it here.
#include <gtest/gtest.h>

#include "framework/DataTypes.h"
#include "values/TypeMask.h"
#include "values/ValueTypes.h"

namespace {

TEST(TypesAgreementTest, EveryTypeHasTheSameNameCodeAndMaskBit) {
    ASSERT_EQ(ProtUtilsN::DataTypes.size(), values::kValueTypes.size());
    for (const ProtUtilsN::DataType& theirs : ProtUtilsN::DataTypes) {
        const values::ValueType* const ours = values::typeNamed(theirs.typeString);
        ASSERT_NE(nullptr, ours) << theirs.typeString;
        EXPECT_EQ(theirs.type, ours->type) << theirs.typeString;
        EXPECT_EQ(theirs.typeFlag, values::typeMask(theirs.typeString)) << theirs.typeString;
    }
}

TEST(TypesAgreementTest, ValuesHaveTheSameLengthAndArraysTheSameItems) {
    for (const values::ValueType& ours : values::kValueTypes) {
        const auto row = static_cast<std::size_t>(ours.type) - 1;
        const ProtUtilsN::DataType& theirs = ProtUtilsN::DataTypes.at(row);
        if (theirs.fixedLength != 0) {
            EXPECT_EQ(theirs.fixedLength, ours.bytes) << ours.name;
        }
        if (ours.kind != values::ValueKind::Array) continue;
        EXPECT_EQ(theirs.elementType, ours.item) << ours.name;
        EXPECT_EQ(ProtUtilsN::GetDataLength(ours.item), ours.bytes) << ours.name;
    }
}

}  // namespace
