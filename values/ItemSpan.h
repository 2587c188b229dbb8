// Which bits of its area a tag stands for. Pure.
#pragma once

#include <algorithm>
#include <string_view>

#include "platform/ICU_Type.h"
#include "values/ValueTypes.h"

namespace values {

/// @param naturalType  Of an area, as a tag URI writes it.
/// @return bytes of one item of the area; 0 for bits. What has no known type has items of one byte.
inline int itemBytesOf(std::string_view naturalType) {
    const ValueType* natural = typeNamed(naturalType);
    if (natural == nullptr) return 1;
    return natural->type == ICU_Type::boolean ? 0 : natural->bytes;
}

/// What a driver says of a tag; see ITag.
struct TagExtent {
    unsigned byteOffset;
    int bitIndex;
    ICU_Type type;
    ICU_Type itemType;
    int length;
};

/// Bits counted from the area's first item, `end` excluded.
struct BitSpan {
    long long begin;
    long long end;
};

/// @param itemBytes  Of one item of the area; 0: a bit.
/// REQUIRES: the driver has accepted the tag.
inline BitSpan bitSpan(const TagExtent& tag, int itemBytes) {
    const ICU_Type item = tag.itemType == ICU_Type::none ? tag.type : tag.itemType;
    const bool bits = item == ICU_Type::boolean;
    // In a bit area the driver counts in bytes and the bits within; in registers, in registers.
    const long long unit = itemBytes == 0 ? 8 : itemBytes * 8LL;
    const long long shift = itemBytes == 0 || bits ? tag.bitIndex : 0;
    const long long begin = tag.byteOffset * unit + shift;
    const long long length = bits ? tag.length : tag.length * 8LL;
    return {begin, begin + std::max(length, 0LL)};
}

}  // namespace values
