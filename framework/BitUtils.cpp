// Moves single bits between packed buffers and buffers of one byte per bit.
#include "framework/BitUtils.h"

#include <cstddef>
#include <cstdint>

#include "framework/DataTypes.h"

namespace ProtUtilsN {

namespace {

// A running position in a packed buffer. It touches a byte only when one of its bits is asked for,
// so it may stand behind the buffer's end after the last bit.
template <class Byte>
class BitCursor {
  public:
    BitCursor(Byte* buffer, int bit)
        : byte_(buffer + bit / 8), mask_(1U << (static_cast<unsigned>(bit) % 8U)) {}

    bool get() const { return (*byte_ & mask_) != 0; }

    void put(bool on) {
        *byte_ = static_cast<unsigned char>(on ? *byte_ | mask_ : *byte_ & ~mask_);
    }

    void advance() {
        mask_ <<= 1;
        if (mask_ > 0x80U) {
            mask_ = 1;
            ++byte_;
        }
    }

  private:
    Byte* byte_;
    unsigned mask_;
};

using Reader = BitCursor<const unsigned char>;
using Writer = BitCursor<unsigned char>;

}  // namespace

int GetLenOfBits(int startBit, int bitCount) {
    const std::int64_t lastBit = std::int64_t{startBit} + bitCount - 1;
    return static_cast<int>(lastBit / 8 - startBit / 8 + 1);
}

void CopyBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount) {
    shiftBits(dst, srcBit % 8, src, srcBit, bitCount);
}

void UnpackBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount) {
    Reader from(src, srcBit);
    for (int i = 0; i < bitCount; ++i, from.advance()) {
        dst[i] = from.get() ? 1 : 0;
    }
}

void PackBits(unsigned char* dst, const unsigned char* src, int dstBit, int bitCount) {
    Writer to(dst, dstBit);
    for (int i = 0; i < bitCount; ++i, to.advance()) {
        to.put(src[i] != 0);
    }
}

void shiftBits(unsigned char* dst, int dstBit, const unsigned char* src, int srcBit, int bitCount) {
    Writer to(dst, dstBit);
    Reader from(src, srcBit);
    for (int i = 0; i < bitCount; ++i, to.advance(), from.advance()) {
        to.put(from.get());
    }
}

int getStartingBit(const ITag* tag) {
    // Unsigned: an offset from a hostile URI wraps instead of overflowing.
    unsigned bit = tag->GetByteOffset() * 8U;
    if (IsBitType(tag)) bit += static_cast<unsigned>(tag->GetBitIndex());
    return static_cast<int>(bit);
}

int getEndingBit(const ITag* tag) {
    const unsigned bits = IsBitType(tag) ? static_cast<unsigned>(tag->GetVarLength())
                                         : static_cast<unsigned>(tag->PackedLen()) * 8U;
    return static_cast<int>(static_cast<unsigned>(getStartingBit(tag)) + bits);
}

}  // namespace ProtUtilsN
