// A tag made of nothing but its type, its place and its conversions.
#pragma once

#include <string>
#include <vector>

#include "framework/DataTypes.h"
#include "framework/TagBase.h"

class ValueTag : public TagBase {
  public:
    /// @param dataType  As in a tag URI, with its conversions.
    explicit ValueTag(const std::string& dataType, int byteOffset = 0, int bitIndex = 0)
        : name_(dataType), byteOffset_(byteOffset), bitIndex_(bitIndex) {
        std::vector<std::string> conversions;
        ProtUtilsN::GetICOMType(dataType, type_, itemType_, length_, conversions);
        setConversions(conversions);
    }

    void setType(ICU_Type type, ICU_Type itemType, int length) {
        type_ = type;
        itemType_ = itemType;
        length_ = length;
    }

    ITag* Clone() const override { return new ValueTag(*this); }
    unsigned int GetByteOffset() const override { return static_cast<unsigned>(byteOffset_); }
    int GetBitIndex() const override { return bitIndex_; }
    const char* GetVarName() const override { return name_.c_str(); }
    ICU_Type GetVarType() const override { return type_; }
    int GetVarLength() const override { return length_; }
    ICU_Type GetItemType() const override { return itemType_; }

  private:
    std::string name_;
    ICU_Type type_ = ICU_Type::none;
    ICU_Type itemType_ = ICU_Type::none;
    int length_ = 0;
    int byteOffset_;
    int bitIndex_;
};
