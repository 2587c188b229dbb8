#include "tests/support/Replies.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>

namespace testing_support {

namespace {

std::uint32_t mirrored(std::uint32_t value, int bits) {
    std::uint32_t result = 0;
    for (int i = 0; i < bits; ++i)
        if ((value >> i) & 1U) result |= 1U << (bits - 1 - i);
    return result;
}

void putWord(Bytes& bytes, std::uint16_t word) {
    bytes.push_back(static_cast<std::uint8_t>(word / 256));
    bytes.push_back(static_cast<std::uint8_t>(word % 256));
}

}  // namespace

// Long division by x^16 + x^15 + x^2 + 1, most significant bit first on mirrored bytes: not the way
// the driver goes.
Bytes crcOf(const Bytes& message) {
    std::uint32_t remainder = 0xFFFF;
    for (const std::uint8_t byte : message) {
        remainder ^= mirrored(byte, 8) << 8;
        for (int bit = 0; bit < 8; ++bit) {
            remainder <<= 1;
            if (remainder > 0xFFFF) remainder ^= 0x18005;
        }
    }
    const std::uint32_t crc = mirrored(remainder, 16);
    return {static_cast<std::uint8_t>(crc & 0xFF), static_cast<std::uint8_t>(crc >> 8)};
}

std::uint8_t lrcOf(const Bytes& message) {
    const int sum = std::accumulate(message.begin(), message.end(), 0);
    return static_cast<std::uint8_t>((256 - sum % 256) % 256);
}

Bytes rtuFrame(const Bytes& message) {
    return message + crcOf(message);
}

Bytes asciiFrame(const Bytes& message) {
    std::string digits = toHex(message + Bytes{lrcOf(message)});
    std::erase(digits, ' ');
    return characters(":" + digits + "\r\n");
}

Bytes rtuMessage(const Bytes& frame) {
    if (frame.size() < 4) {
        ADD_FAILURE() << "no frame: " << toHex(frame);
        return {};
    }
    Bytes message = firstOf(frame, frame.size() - 2);
    EXPECT_EQ(toHex(rtuFrame(message)), toHex(frame));
    return message;
}

Bytes asciiMessage(const Bytes& frame) {
    if (frame.size() < 9) {
        ADD_FAILURE() << "no frame: " << toHex(frame);
        return {};
    }
    Bytes message = hex(std::string(frame.begin() + 1, frame.end() - 2));
    message.pop_back();
    EXPECT_EQ(toHex(asciiFrame(message)), toHex(frame));
    return message;
}

Bytes registersReply(std::uint8_t node, std::uint8_t function,
                     const std::vector<std::uint16_t>& registers) {
    Bytes bytes{node, function, static_cast<std::uint8_t>(2 * registers.size())};
    for (const std::uint16_t value : registers)
        putWord(bytes, value);
    return bytes;
}

Bytes bitsReply(std::uint8_t node, std::uint8_t function, const std::vector<bool>& bits) {
    Bytes packed((bits.size() + 7) / 8, 0);
    for (std::size_t i = 0; i < bits.size(); ++i)
        if (bits[i]) packed[i / 8] = static_cast<std::uint8_t>(packed[i / 8] | (1U << (i % 8)));
    return Bytes{node, function, static_cast<std::uint8_t>(packed.size())} + packed;
}

Bytes exceptionReply(std::uint8_t node, std::uint8_t function, std::uint8_t code) {
    return {node, static_cast<std::uint8_t>(function | 0x80), code};
}

Bytes writeReply(std::uint8_t node, std::uint8_t function, std::uint16_t address,
                 std::uint16_t valueOrCount) {
    Bytes bytes{node, function};
    putWord(bytes, address);
    putWord(bytes, valueOrCount);
    return bytes;
}

Bytes request(std::uint8_t node, std::uint8_t function, std::uint16_t address,
              std::uint16_t count) {
    return writeReply(node, function, address, count);
}

}  // namespace testing_support
