// The way of a tag's value between the device's packed bytes and the run time's.
#include "framework/TagBase.h"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <utility>

#include "framework/BitUtils.h"
#include "framework/Conversions.h"
#include "framework/DataTypes.h"
#include "framework/ScratchBuffer.h"

namespace {

/// Bytes of a value that are converted without the heap.
constexpr int kLocalValueBytes = 256;

constexpr const char* kOutOfMemory = "Out of memory";

std::size_t atLeastZero(int length) {
    return static_cast<std::size_t>(std::max(length, 0));
}

}  // namespace

int TagBase::PackedLen() const {
    const int length = GetVarLength();
    return ProtUtilsN::IsBitType(this) ? ProtUtilsN::GetLenOfBits(GetBitIndex(), length) : length;
}

bool TagBase::ConvertVariable(const unsigned char* src, unsigned char* dst, bool toDevice) const {
    return Convert(src, dst, toDevice);
}

bool TagBase::Convert(const unsigned char* src, unsigned char* dst, bool toDevice) const {
    const bool bits = ProtUtilsN::IsBitType(this);
    // Such a bit would lie in front of the caller's buffer.
    if (bits && GetBitIndex() < 0) {
        error_.show("Bit index is negative");
        return false;
    }
    // Bits are worked on unpacked: how far from the image's start they lie does not count.
    ScratchBuffer<kLocalValueBytes> work(bits ? GetVarLength()
                                              : std::max(PackedLen(), GetVarLength()));
    if (work.data() == nullptr) {
        error_.show(kOutOfMemory);
        return false;
    }
    return toDevice ? toDeviceForm(src, dst, work.data()) : toRunTimeForm(src, dst, work.data());
}

bool TagBase::wasShortOfMemory() const {
    return std::strcmp(getError(), kOutOfMemory) == 0;
}

bool TagBase::toDeviceForm(const unsigned char* src, unsigned char* dst,
                           unsigned char* work) const {
    std::copy_n(src, atLeastZero(GetVarLength()), work);
    const int count = static_cast<int>(conversions_.size());
    for (int number = 0; number < count; ++number) {
        if (!applyOne(work, number, true)) return false;
    }

    if (ProtUtilsN::IsBitType(this)) {
        ProtUtilsN::PackBits(dst, work, GetBitIndex(), GetVarLength());
    } else {
        std::copy_n(work, atLeastZero(PackedLen()), dst);
    }
    return true;
}

bool TagBase::toRunTimeForm(const unsigned char* src, unsigned char* dst,
                            unsigned char* work) const {
    if (ProtUtilsN::IsBitType(this)) {
        ProtUtilsN::UnpackBits(work, src, GetBitIndex(), GetVarLength());
    } else {
        std::copy_n(src, atLeastZero(PackedLen()), work);
    }

    for (int left = static_cast<int>(conversions_.size()); left > 0; --left) {
        if (!applyOne(work, left - 1, false)) return false;
    }
    std::copy_n(work, atLeastZero(GetVarLength()), dst);
    return true;
}

bool TagBase::applyOne(unsigned char* work, int number, bool toDevice) const {
    const auto index = static_cast<std::size_t>(number);
    if (DoConversion(work, conversions_[index].c_str(), toDevice)) return true;
    error_.show(conversionErrors_[index].c_str());
    return false;
}

void TagBase::setConversions(std::vector<std::string> names) {
    std::vector<std::string> errors;
    errors.reserve(names.size());
    for (const std::string& name : names)
        errors.push_back("Conversion error at: " + name);
    conversions_ = std::move(names);
    conversionErrors_ = std::move(errors);
}

void TagBase::SetError(const char* text) const {
    if (!error_.set(text != nullptr ? text : "")) error_.show(kOutOfMemory);
}

bool TagBase::DoConversion(unsigned char* buf, const char* name, bool toDevice) const {
    const ProtUtilsN::ConversionShape shape{GetVarLength(), ProtUtilsN::GetBasicLength(this),
                                            ProtUtilsN::GetItemCount(this),
                                            ProtUtilsN::GetBasicType(this)};
    return ProtUtilsN::applyConversion(buf, name, shape, toDevice);
}
