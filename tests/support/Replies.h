// Modbus frames as a slave sends them, built with check sums of the tests' own.
#pragma once

#include <cstdint>
#include <vector>

#include "tests/support/ByteTexts.h"

namespace testing_support {

/// The CRC of a message in the order of the line: low byte, high byte.
Bytes crcOf(const Bytes& message);
std::uint8_t lrcOf(const Bytes& message);

/// The message with its check, as it goes over the line.
Bytes rtuFrame(const Bytes& message);
Bytes asciiFrame(const Bytes& message);

/// The message inside a frame, for slaves made of a few lines; fails the test on a bad check.
Bytes rtuMessage(const Bytes& frame);
Bytes asciiMessage(const Bytes& frame);

// Messages without their check.

/// Functions 3 and 4.
Bytes registersReply(std::uint8_t node, std::uint8_t function,
                     const std::vector<std::uint16_t>& registers);
/// Functions 1 and 2: `bits` in the order of their addresses.
Bytes bitsReply(std::uint8_t node, std::uint8_t function, const std::vector<bool>& bits);
Bytes exceptionReply(std::uint8_t node, std::uint8_t function, std::uint8_t code);
/// The acknowledgement of functions 5, 6 (value) and 15, 16 (count).
Bytes writeReply(std::uint8_t node, std::uint8_t function, std::uint16_t address,
                 std::uint16_t valueOrCount);

/// Node, function and two words: what every read request consists of.
Bytes request(std::uint8_t node, std::uint8_t function, std::uint16_t address, std::uint16_t count);

}  // namespace testing_support
