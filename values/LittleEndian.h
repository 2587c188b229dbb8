// Numbers as little-endian bytes, the run-time form of values.
#pragma once

#include <cstddef>
#include <cstdint>

#include "wire/Bytes.h"

namespace values {

using wire::Bytes;
using wire::ByteView;

/// Appends the low `count` bytes of `bits`, least significant first.
inline void appendLittleEndian(Bytes& out, std::uint64_t bits, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i)
        out.push_back(static_cast<std::uint8_t>(bits >> 8 * i));
}

/// @return the bytes as a number, the first being the least significant. At most 8 of them.
inline std::uint64_t fromLittleEndian(ByteView bytes) {
    std::uint64_t bits = 0;
    for (std::size_t i = 0; i < bytes.size(); ++i)
        bits |= std::uint64_t{bytes[i]} << 8 * i;
    return bits;
}

}  // namespace values
