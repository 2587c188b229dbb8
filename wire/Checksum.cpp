#include "wire/Checksum.h"

namespace wire {

std::uint16_t crc16(ByteView bytes) {
    // Bit by bit, without a table: nothing here is in a hurry, and there is less to get wrong.
    std::uint32_t crc = 0xFFFF;
    for (const std::uint8_t byte : bytes) {
        crc ^= byte;
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc >> 1) ^ ((crc & 1U) != 0 ? 0xA001U : 0U);
    }
    return static_cast<std::uint16_t>(crc);
}

std::uint8_t lrc8(ByteView bytes) {
    std::uint32_t sum = 0;
    for (const std::uint8_t byte : bytes)
        sum += byte;
    return static_cast<std::uint8_t>((0x100U - (sum & 0xFFU)) & 0xFFU);
}

}  // namespace wire
