// The description against the conversions of the framework: what is offered for a data type works
// on it.
#include <gtest/gtest.h>

#include "framework/DataTypes.h"
#include "framework/TagBase.h"
#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

/// A tag that is nothing but its data type; arrays have eight items.
class TypedTag final : public TagBase {
  public:
    explicit TypedTag(const ProtUtilsN::DataType& row) {
        const bool array = row.typeString.ends_with('-');
        std::vector<std::string> none;
        known_ = ProtUtilsN::GetICOMType(std::string(row.typeString) + (array ? "8" : ""), type_,
                                         itemType_, length_, none);
    }

    bool known() const { return known_; }

    ITag* Clone() const override { return new TypedTag(*this); }
    unsigned int GetByteOffset() const override { return 0; }
    int GetBitIndex() const override { return 0; }
    const char* GetVarName() const override { return ""; }
    ICU_Type GetVarType() const override { return type_; }
    int GetVarLength() const override { return length_; }
    ICU_Type GetItemType() const override { return itemType_; }

  private:
    bool known_ = false;
    ICU_Type type_ = ICU_Type::none;
    ICU_Type itemType_ = ICU_Type::none;
    int length_ = 0;
};

bool offered(const pugi::xml_node& conversion, const ProtUtilsN::DataType& type) {
    return (conversion.attribute("icomTypes").as_uint() & type.typeFlag) != 0;
}

/// Zeroes are a value of every type and valid BCD.
bool works(const std::string& conversion, const ProtUtilsN::DataType& type, bool toDevice) {
    const TypedTag tag(type);
    EXPECT_TRUE(tag.known()) << type.typeString;
    std::vector<unsigned char> value(static_cast<std::size_t>(tag.GetVarLength()) + 1);
    return tag.DoConversion(value.data(), conversion.c_str(), toDevice);
}

TEST(ConversionAgreementTest, WhatIsOfferedForATypeWorksOnItInBothDirections) {
    int compared = 0;
    for (const auto& conversion : root().child("conversions").children("conversion")) {
        for (const ProtUtilsN::DataType& type : ProtUtilsN::DataTypes) {
            if (!offered(conversion, type)) continue;
            EXPECT_TRUE(works(textOf(conversion), type, true))
                << type.typeString << '(' << textOf(conversion) << ')';
            EXPECT_TRUE(works(textOf(conversion), type, false))
                << type.typeString << '(' << textOf(conversion) << ')';
            ++compared;
        }
    }
    EXPECT_GT(compared, 7 * 5);
}

// A string's items are bytes, so that "neg" works on it although nobody is offered to negate a
// text.
bool worksUnoffered(std::string_view conversion, const ProtUtilsN::DataType& type) {
    return conversion == "neg" && type.type == ICU_Type::string;
}

TEST(ConversionAgreementTest, TypesThatAreNotOfferedAreRefusedWhereTheTypeDecides) {
    for (const char* name : {"inv", "neg"}) {
        const auto conversion = childWithText(root().child("conversions"), name);
        for (const ProtUtilsN::DataType& type : ProtUtilsN::DataTypes) {
            EXPECT_EQ(offered(conversion, type) || worksUnoffered(name, type),
                      works(name, type, true))
                << type.typeString << '(' << name << ')';
        }
    }
}

TEST(ConversionAgreementTest, WhatIsNotDescribedDoesNotExist) {
    EXPECT_TRUE(childWithText(root().child("conversions"), "swap3").empty());
    EXPECT_FALSE(works("swap3", ProtUtilsN::DataTypes.at(3), false));
}

}  // namespace
}  // namespace description_test
