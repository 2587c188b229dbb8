// Byte strings of the tests, written and printed as hexadecimal.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace testing_support {

using Bytes = std::vector<std::uint8_t>;

/// Reads "01 03 00 0A"; blanks are skipped. Fails the test on anything else.
Bytes hex(std::string_view text);

/// The characters of `text`, without a terminating zero.
Bytes characters(std::string_view text);

/// "01 03 00 0A", for failure messages.
std::string toHex(const Bytes& bytes);

/// Both, one behind the other.
Bytes operator+(const Bytes& front, const Bytes& back);

/// `bytes` with the byte at `index` replaced. REQUIRES: index < bytes.size().
Bytes withByte(Bytes bytes, std::size_t index, std::uint8_t value);

/// The first `count` bytes.
Bytes firstOf(const Bytes& bytes, std::size_t count);

}  // namespace testing_support
