// What the tests of the conversions have in common: shapes, calls and numbers as bytes.
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

#include "framework/Conversions.h"
#include "framework/DataTypes.h"

namespace conversions_test {

using Bytes = std::vector<unsigned char>;
using ProtUtilsN::ConversionShape;

inline constexpr bool kRead = false;
inline constexpr bool kWrite = true;

inline ConversionShape Shape(ICU_Type itemType, int items = 1) {
    const int size = ProtUtilsN::GetDataLength(itemType);
    return {size * items, size, items, itemType};
}

// Byte values without meaning as a number, for the conversions that look at the length alone.
inline ConversionShape Raw(int length) {
    return {length, 1, length, ICU_Type::unsignedByte};
}

// What becomes of the bytes; empty when the conversion refuses them.
inline Bytes Converted(Bytes bytes, const char* name, const ConversionShape& shape, bool toDevice) {
    const bool ok = ProtUtilsN::applyConversion(bytes.data(), name, shape, toDevice);
    return ok ? bytes : Bytes{};
}

inline bool Refuses(const char* name, const ConversionShape& shape, bool toDevice) {
    Bytes bytes(static_cast<std::size_t>(std::max(shape.length, 1)), 0);
    return !ProtUtilsN::applyConversion(bytes.data(), name, shape, toDevice);
}

inline Bytes LittleEndian(std::uint64_t value, int size) {
    Bytes bytes;
    for (int k = 0; k < size; ++k)
        bytes.push_back(static_cast<unsigned char>(value >> (8 * k)));
    return bytes;
}

}  // namespace conversions_test
