#include "wire/Checksum.h"

#include <array>

namespace wire {

namespace {

using Table = std::array<std::uint16_t, 256>;

/// What eight steps of the polynomial make of each low byte.
constexpr Table crcTable() {
    Table table{};
    for (std::uint32_t byte = 0; byte < table.size(); ++byte) {
        std::uint32_t crc = byte;
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc >> 1U) ^ ((crc & 1U) != 0 ? 0xA001U : 0U);
        table[byte] = static_cast<std::uint16_t>(crc);
    }
    return table;
}

constexpr Table kCrcTable = crcTable();

}  // namespace

// With a table, since it runs on every reply of a port.
std::uint16_t crc16(ByteView bytes) {
    std::uint32_t crc = 0xFFFF;
    for (const std::uint8_t byte : bytes)
        crc = (crc >> 8U) ^ kCrcTable[(crc ^ byte) & 0xFFU];
    return static_cast<std::uint16_t>(crc);
}

std::uint8_t lrc8(ByteView bytes) {
    std::uint32_t sum = 0;
    for (const std::uint8_t byte : bytes)
        sum += byte;
    return static_cast<std::uint8_t>((0x100U - (sum & 0xFFU)) & 0xFFU);
}

}  // namespace wire
