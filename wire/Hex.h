// Bytes as hexadecimal digits.
#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "wire/Bytes.h"

namespace wire {

/// Upper-case digits, the only ones of the ASCII mode.
inline constexpr std::string_view kHexDigits = "0123456789ABCDEF";

/// @return 0..15; nothing for a character other than 0-9 and A-F.
std::optional<std::uint8_t> hexValue(std::uint8_t character);

/// Appends two digits.
void putHex(Bytes& out, std::uint8_t byte);

/// Stores the bytes of an even number of digits.
/// @return how many there are; nothing for any other text and for one that `room` does not hold,
/// which may have been written to by then.
std::optional<std::size_t> bytesInHex(ByteView characters, std::span<std::uint8_t> room);

/// @return the bytes of an even number of digits; nothing for any other text.
std::optional<Bytes> fromHex(ByteView characters);

/// @return two digits for each byte with `between` in between: "01 0A".
std::string hexText(ByteView bytes, std::string_view between = " ");

}  // namespace wire
