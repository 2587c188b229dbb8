// The way of a tag's value between the device's packed bytes and the run time's.
#include "framework/TagBase.h"

#include <algorithm>
#include <cstddef>

#include "framework/BitUtils.h"
#include "framework/Conversions.h"
#include "framework/DataTypes.h"
#include "framework/ScratchBuffer.h"

namespace {

/// Bytes of a value that are converted without the heap.
constexpr int kLocalValueBytes = 256;

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
    ScratchBuffer<kLocalValueBytes> work(std::max(PackedLen(), GetVarLength()));
    if (work.data() == nullptr) return false;
    return toDevice ? toDeviceForm(src, dst, work.data()) : toRunTimeForm(src, dst, work.data());
}

bool TagBase::toDeviceForm(const unsigned char* src, unsigned char* dst,
                           unsigned char* work) const {
    std::copy_n(src, atLeastZero(GetVarLength()), work);
    for (const std::string& name : conversions_) {
        if (!applyOne(work, name, true)) return false;
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

    for (auto name = conversions_.rbegin(); name != conversions_.rend(); ++name) {
        if (!applyOne(work, *name, false)) return false;
    }
    std::copy_n(work, atLeastZero(GetVarLength()), dst);
    return true;
}

bool TagBase::applyOne(unsigned char* work, const std::string& name, bool toDevice) const {
    if (DoConversion(work, name.c_str(), toDevice)) return true;
    SetError(("Conversion error at: " + name).c_str());
    return false;
}

bool TagBase::DoConversion(unsigned char* buf, const char* name, bool toDevice) const {
    const ProtUtilsN::ConversionShape shape{GetVarLength(), ProtUtilsN::GetBasicLength(this),
                                            ProtUtilsN::GetItemCount(this),
                                            ProtUtilsN::GetBasicType(this)};
    return ProtUtilsN::ApplyConversion(buf, name, shape, toDevice);
}
