// Which memory items hold a tag, or a part of it. Pure, callable from any thread.
//
// A tag's *device image* is the device form that ITag::ConvertVariable() works on. In register
// memories it begins with the first item at the tag's offset; in bit memories its bit k belongs to
// address (offset / 8) * 8 + k.
#pragma once

#include <cstdint>

#include "engine/ProtgenTag.h"

namespace engine {

/// Bits of a tag's device image, `end` excluded.
struct BitRange {
    int begin;
    int end;

    int size() const { return end - begin; }
    bool operator==(const BitRange&) const = default;
};

/// The memory items that hold a bit range, and the stretch of the device image that they fill.
struct Footprint {
    int address;   ///< Of the first item.
    int count;     ///< Items; bits in a bit memory.
    int firstBit;  ///< The image's bit with which the stretch begins, a multiple of 8.
    int bytes;     ///< Length of the stretch.
    bool partial;  ///< Some item holds bits beside the range as well.

    int firstByte() const { return firstBit / 8; }
    bool operator==(const Footprint&) const = default;
};

/// @return the most items of one request that the tag's memory is declared with; 0 for an area of
/// the driver itself, which is not addressed in blocks.
int declaredBlock(const ProtgenTag& tag, bool write);

/// @return the number of items from the tag's offset to the item that holds its last bit; 0 when
/// its length is not positive.
std::int64_t itemsOfTag(const ProtgenTag& tag);

/// @return why `items` items from the tag's offset on cannot be accessed, or null when they can.
const char* accessFault(const ProtgenTag& tag, std::int64_t items, bool write);

/// @return the bits that `length` bytes of the tag's bit memory stand for: the tag's own ones when
/// that is its packed length, else all to the end of the last byte.
std::int64_t bitsOfBlock(const ProtgenTag& tag, int length);

/// @return the byte of a buffer for the items from `address` on that holds item `number` of them.
int byteOfItem(const ProtgenTag& tag, int address, int number);

// The following REQUIRE: accessFault() of the whole tag is null.

/// The bits of the whole tag.
BitRange wholeTag(const ProtgenTag& tag);

/// The bits of array item `index` together with the items that the tag's swaps exchange it with.
/// REQUIRES: the tag is an array and has that item.
BitRange arrayItem(const ProtgenTag& tag, int index);

Footprint footprint(const ProtgenTag& tag, const BitRange& range);

}  // namespace engine
