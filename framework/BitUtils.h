// Bits in packed buffers. Bit k of a buffer is bit k % 8 of byte k / 8; bit 0 of a byte is its
// least significant one. Pure, callable from any thread. A count below 1 changes nothing.
#pragma once

#include "platform/ITag.h"

namespace ProtUtilsN {

/// @return the number of bytes that `bitCount` bits from `startBit` on touch. A zero count inside a
/// byte still counts that byte.
int GetLenOfBits(int startBit, int bitCount);

/// Copies bits to the same position within the byte: source bit `srcBit` goes to bit `srcBit` % 8
/// of `dst[0]`, the next ones behind it. Other destination bits keep their values.
void CopyBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount);

/// Stores each source bit as a byte of its own, 0 or 1.
void UnpackBits(unsigned char* dst, const unsigned char* src, int srcBit, int bitCount);

/// Sets or clears destination bit `dstBit` + i as `src[i]` is non-zero or zero. Other destination
/// bits keep their values.
void PackBits(unsigned char* dst, const unsigned char* src, int dstBit, int bitCount);

/// Copies source bit `srcBit` + i to destination bit `dstBit` + i. Other destination bits keep
/// their values.
void shiftBits(unsigned char* dst, int dstBit, const unsigned char* src, int srcBit, int bitCount);

/// @return the number of the tag's first bit, and of the first one behind it.
int getStartingBit(const ITag* tag);
int getEndingBit(const ITag* tag);

}  // namespace ProtUtilsN
