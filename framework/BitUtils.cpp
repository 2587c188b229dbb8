// Moves bits between packed buffers and buffers of one byte per bit.
#include "framework/BitUtils.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>

#include "framework/DataTypes.h"

namespace ProtUtilsN {

namespace {

constexpr int kByteBits = 8;

// A running position in a packed buffer. It touches a byte only when one of its bits is asked for,
// so it may stand behind the buffer's end after the last bit.
template <class Byte>
class BitCursor {
  public:
    BitCursor(Byte* buffer, int bit)
        : byte_(buffer + bit / kByteBits), bit_(static_cast<unsigned>(bit) % kByteBits) {}

    bool atByte() const { return bit_ == 0; }
    bool take() {
        const bool on = (*byte_ >> bit_ & 1U) != 0;
        advance();
        return on;
    }
    void put(bool on) {
        const unsigned mask = 1U << bit_;
        *byte_ = static_cast<unsigned char>(on ? *byte_ | mask : *byte_ & ~mask);
        advance();
    }

    // The next eight bits, which may lie in two bytes.
    unsigned takeEight() {
        const unsigned low = *byte_++;
        return atByte() ? low : (low | unsigned{*byte_} << kByteBits) >> bit_ & 0xFFU;
    }
    // REQUIRES: atByte().
    void putEight(unsigned eight) { *byte_++ = static_cast<unsigned char>(eight); }

  private:
    void advance() {
        bit_ = (bit_ + 1) % kByteBits;
        if (bit_ == 0) ++byte_;
    }

    Byte* byte_;
    unsigned bit_;
};

using Reader = BitCursor<const unsigned char>;
using Writer = BitCursor<unsigned char>;

using Nibble = std::array<unsigned char, 4>;

constexpr auto kUnpackedNibbles = [] {
    std::array<Nibble, 16> nibbles{};
    for (std::size_t value = 0; value < nibbles.size(); ++value)
        for (std::size_t bit = 0; bit < 4; ++bit)
            nibbles[value][bit] = static_cast<unsigned char>(value >> bit & 1U);
    return nibbles;
}();

// The bytes that a copy touches in one of its buffers.
struct Extent {
    const unsigned char* begin;
    const unsigned char* end;
};

Extent packed(const unsigned char* buffer, int bit, int count) {
    const unsigned char* begin = buffer + bit / kByteBits;
    return {begin, begin + GetLenOfBits(bit % kByteBits, count)};
}

Extent unpacked(const unsigned char* buffer, int count) {
    return {buffer, buffer + count};
}

bool areApart(const Extent& one, const Extent& other) {
    const std::less_equal<> before;
    return before(one.end, other.begin) || before(other.end, one.begin);
}

// Moves bits in order: singly until `cursor` stands at a byte, then by eights, then the rest. Where
// the buffers overlap, all go singly: what was just written may be what is read next.
template <class Byte, class MoveOne, class MoveEight>
void moveBits(const BitCursor<Byte>& cursor, int count, bool apart, MoveOne moveOne,
              MoveEight moveEight) {
    for (; apart && count > 0 && !cursor.atByte(); --count)
        moveOne();
    for (; apart && count >= kByteBits; count -= kByteBits)
        moveEight();
    for (; count > 0; --count)
        moveOne();
}

}  // namespace

int GetLenOfBits(int startBit, int bitCount) {
    const std::int64_t lastBit = std::int64_t{startBit} + bitCount - 1;
    return static_cast<int>(lastBit / 8 - startBit / 8 + 1);
}

void CopyBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount) {
    shiftBits(dst, srcBit % 8, src, srcBit, bitCount);
}

void UnpackBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount) {
    if (bitCount < 1) return;
    Reader from(src, srcBit);
    const auto one = [&] { *dst++ = from.take() ? 1 : 0; };
    const auto eight = [&] {
        const unsigned bits = from.takeEight();
        dst = std::copy_n(kUnpackedNibbles[bits & 0xFU].begin(), 4, dst);
        dst = std::copy_n(kUnpackedNibbles[bits >> 4].begin(), 4, dst);
    };
    moveBits(from, bitCount, areApart(unpacked(dst, bitCount), packed(src, srcBit, bitCount)), one,
             eight);
}

void PackBits(unsigned char* dst, const unsigned char* src, int dstBit, int bitCount) {
    if (bitCount < 1) return;
    Writer to(dst, dstBit);
    const auto one = [&] { to.put(*src++ != 0); };
    const auto eight = [&] {
        unsigned bits = 0;
        for (int bit = 0; bit < kByteBits; ++bit)
            bits |= (src[bit] != 0 ? 1U : 0U) << bit;
        src += kByteBits;
        to.putEight(bits);
    };
    moveBits(to, bitCount, areApart(packed(dst, dstBit, bitCount), unpacked(src, bitCount)), one,
             eight);
}

void shiftBits(unsigned char* dst, int dstBit, const unsigned char* src, int srcBit, int bitCount) {
    if (bitCount < 1) return;
    Writer to(dst, dstBit);
    Reader from(src, srcBit);
    const auto one = [&] { to.put(from.take()); };
    const auto eight = [&] { to.putEight(from.takeEight()); };
    moveBits(to, bitCount, areApart(packed(dst, dstBit, bitCount), packed(src, srcBit, bitCount)),
             one, eight);
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
