// The generic engine's tag.
#include "engine/ProtgenTag.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>

#include "framework/DataTypes.h"
#include "framework/Guarded.h"
#include "framework/TextUtils.h"

namespace {

constexpr std::string_view kAddressField = "arrayindex.subindex";

// The URI's address field; empty where names or URI lack it.
std::string addressField(const std::string& uri, const char* const* fieldNames) {
    if (fieldNames == nullptr) return {};
    std::size_t position = 0;
    while (fieldNames[position] != nullptr && kAddressField != fieldNames[position])
        ++position;
    if (fieldNames[position] == nullptr) return {};
    std::vector<std::string> fields;
    ProtUtilsN::ParseSubstrings(uri, fields, '?');
    return position < fields.size() ? fields[position] : std::string();
}

}  // namespace

ProtgenTag::ProtgenTag(const char* uri, const char* const* fieldNames) {
    complete_ = guarded(
        false, [] {},
        [&] {
            if (uri != nullptr) uri_ = uri;
            takeAddress(fieldNames);
            return true;
        });
}

void ProtgenTag::takeAddress(const char* const* fieldNames) {
    const std::string address = addressField(uri_, fieldNames);
    const std::size_t dot = address.find('.');
    offset_ = ProtUtilsN::parseInteger(address.substr(0, dot).c_str());
    if (dot == std::string::npos) return;
    subIndex_ = ProtUtilsN::parseInteger(address.substr(dot + 1).c_str());
}

ITag* ProtgenTag::Clone() const {
    return guarded(
        static_cast<ITag*>(nullptr), [this] { SetError("Out of memory"); },
        [this]() -> ITag* { return new ProtgenTag(*this); });
}

unsigned int ProtgenTag::GetByteOffset() const {
    return static_cast<unsigned int>(inBitMemory() ? offset_ / 8 : offset_);
}

int ProtgenTag::GetBitIndex() const {
    return inBitMemory() ? offset_ % 8 : subIndex_;
}

int ProtgenTag::PackedLen() const {
    // Whoever makes a buffer of this length must not meet a negative one.
    if (length_ <= 0) return 0;
    const bool bits = ProtUtilsN::IsBitType(type_);
    if (!bits || memoryType_ == nullptr || inBitMemory()) return TagBase::PackedLen();
    const std::int64_t bytes = (std::int64_t{subIndex_} + length_ + 7) / 8;
    return static_cast<int>(
        std::clamp(bytes, std::int64_t{0}, std::int64_t{std::numeric_limits<int>::max()}));
}

bool ProtgenTag::IsReadOnly() const {
    return memoryType_ != nullptr && memoryType_->isReadOnly();
}

bool ProtgenTag::setDataType(ICU_Type type, ICU_Type itemType, int length,
                             std::vector<std::string> conversions) {
    const bool taken = guarded(
        false, [] {},
        [&] {
            setConversions(std::move(conversions));
            return true;
        });
    if (!taken) return false;
    type_ = type;
    itemType_ = itemType;
    length_ = length;
    return true;
}

bool ProtgenTag::inBitMemory() const {
    return memoryType_ != nullptr && ProtUtilsN::IsBitType(memoryType_->getNaturalType());
}

int ProtgenTag::memoryItemLength() const {
    if (memoryType_ == nullptr) return 1;
    return std::max(ProtUtilsN::GetDataLength(memoryType_->getNaturalType()), 1);
}
