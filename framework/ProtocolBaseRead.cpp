// The generic reads: one tag, time-stamped, a datagram, an item of an array.
#include <algorithm>
#include <cstring>
#include <limits>

#include "framework/DataTypes.h"
#include "framework/ProtocolBase.h"
#include "framework/ScratchBuffer.h"
#include "framework/TagBase.h"

namespace {

/// Bytes of a tag, and of a whole array, that are read without the heap.
constexpr int kLocalTagBytes = 64;
constexpr int kLocalArrayBytes = 256;

constexpr int kConversionError = -9;

/// @return how many bits to read for the tag's `length` bytes of device form.
int bitsToRead(const ITag* tag, int length) {
    if (ProtUtilsN::IsBitType(tag)) return tag->GetVarLength();
    return static_cast<int>(std::min<long long>(8LL * length, std::numeric_limits<int>::max()));
}

/// The bytes of item `index` within the run-time form of its array.
struct ItemPlace {
    std::size_t offset;
    std::size_t length;
};

/// REQUIRES: `index` is in range.
ItemPlace placeOf(const ITag* tag, int index) {
    const auto length = static_cast<std::size_t>(ProtUtilsN::GetBasicLength(tag));
    return {static_cast<std::size_t>(index) * length, length};
}

}  // namespace

bool ProtocolBase::refuseRead(const ITag* tag) {
    const char* const fault = readCheck_ != nullptr ? readCheck_(tag) : nullptr;
    if (fault != nullptr) SetError(-1, fault);
    return fault != nullptr;
}

int ProtocolBase::Read(const ITag* tag, unsigned char* value) {
    if (refuseRead(tag)) return 0;
    const int length = tag->PackedLen();
    ScratchBuffer<kLocalTagBytes> raw(length);
    if (raw.data() == nullptr) return outOfMemory();
    const int ok = CanReadBitBlock(tag) ? ReadBitBlock(tag, raw.data(), bitsToRead(tag, length))
                                        : ReadBlock(tag, raw.data(), length);
    if (ok == 0) return 0;
    if (!tag->ConvertVariable(raw.data(), value, false)) {
        return conversionFailed(tag, "read conversion error");
    }
    return ok;
}

int ProtocolBase::conversionFailed(const ITag* tag, const char* text) noexcept {
    if (static_cast<const TagBase*>(tag)->wasShortOfMemory()) return outOfMemory();
    SetError(kConversionError, text);
    return 0;
}

int ProtocolBase::readWithTimestamp(const ITag* tag, unsigned char* value,
                                    unsigned long long* stamp) {
    const int ok = Read(tag, value);
    if (ok != 0) *stamp = currentTimeStamp();
    return ok;
}

int ProtocolBase::readBlockWithTimestamp(const ITag* tag, unsigned char* data, int length,
                                         unsigned long long* stamp) {
    const int ok = ReadBlock(tag, data, length);
    if (ok != 0) *stamp = currentTimeStamp();
    return ok;
}

int ProtocolBase::readBitBlockWithTimestamp(const ITag* tag, unsigned char* data, int bits,
                                            unsigned long long* stamp) {
    const int ok = ReadBitBlock(tag, data, bits);
    if (ok != 0) *stamp = currentTimeStamp();
    return ok;
}

int ProtocolBase::ReadDatagramWithStatus(const ITag* const* tags, int count, unsigned char* data,
                                         idal_error_t* status) {
    const int ok = ReadDatagram(tags, count, data);
    if (ok != 0 && count > 0) std::fill_n(status, count, kItemDone);
    return ok;
}

int ProtocolBase::readDatagramWithTimestamp(const ITag* const* tags, int count, unsigned char* data,
                                            idal_error_t* status, unsigned long long* stamps) {
    if (ReadDatagramWithStatus(tags, count, data, status) == 0) return 0;
    if (count > 0) std::fill_n(stamps, count, currentTimeStamp());
    return 1;
}

bool ProtocolBase::CanAddToDatagram(const ITag* const* tags, int count, const ITag* candidate) {
    // An empty datagram has no first tag to compare with; the candidate is then its own company.
    const ITag* first = count > 0 ? tags[0] : candidate;
    if (!CanCoexistInDatagram(first, candidate)) return false;
    if (MaxDatagramItems(candidate) <= count) return false;

    long long total = candidate->PackedLen();
    for (int i = 0; i < count; ++i)
        total += tags[i]->PackedLen();
    return total <= MaxDatagramLength(candidate);
}

bool ProtocolBase::arrayItemInRange(const ITag* tag, int index) {
    if (tag->GetItemType() == ICU_Type::none) {
        SetError(-1, "accessing an array item where the tag is not array");
        return false;
    }
    if (index < 0 || index >= ProtUtilsN::GetItemCount(tag)) {
        SetError(-1, "accessing array item out of range");
        return false;
    }
    return true;
}

int ProtocolBase::readArrayItem(const ITag* tag, int index, unsigned char* value) {
    if (!arrayItemInRange(tag, index) || refuseRead(tag)) return 0;
    ScratchBuffer<kLocalArrayBytes> array(tag->GetVarLength());
    if (array.data() == nullptr) return outOfMemory();
    const int ok = Read(tag, array.data());
    if (ok == 0) return 0;
    const ItemPlace item = placeOf(tag, index);
    std::memcpy(value, array.data() + item.offset, item.length);
    return ok;
}

int ProtocolBase::writeArrayItem(const ITag* tag, int index, const unsigned char* value) {
    if (!arrayItemInRange(tag, index) || refuseRead(tag)) return 0;
    ScratchBuffer<kLocalArrayBytes> array(tag->GetVarLength());
    if (array.data() == nullptr) return outOfMemory();
    if (Read(tag, array.data()) == 0) return 0;
    const ItemPlace item = placeOf(tag, index);
    std::memcpy(array.data() + item.offset, value, item.length);
    return Write(tag, array.data());
}
