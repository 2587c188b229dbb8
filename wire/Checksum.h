// The two checks of serial Modbus.
#pragma once

#include "wire/Bytes.h"

namespace wire {

/// CRC-16/MODBUS: start 0xFFFF, reflected polynomial 0xA001, no final change. The check value of
/// "123456789" is 0x4B37. On the line its low byte goes first.
/// Source: Modbus over Serial Line V1.02, 2.5.1.2 and appendix 6.2.2.
std::uint16_t crc16(ByteView bytes);

/// The byte that makes the 8-bit sum of all bytes zero.
/// Source: Modbus over Serial Line V1.02, 2.5.2.2 and appendix 6.2.1.
std::uint8_t lrc8(ByteView bytes);

}  // namespace wire
