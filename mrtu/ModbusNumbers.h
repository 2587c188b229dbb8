// The numbers of the Modbus standard that the driver goes by: function codes, node addresses and
// the lengths of frames. Pure facts, no code.
#pragma once

#include <cstddef>
#include <cstdint>

namespace _MRTU {

/// Source: Modbus Application Protocol V1.1b3, 6.
inline constexpr std::uint8_t kReadCoils = 1;
inline constexpr std::uint8_t kReadInputs = 2;
inline constexpr std::uint8_t kReadRegisters = 3;
inline constexpr std::uint8_t kReadInputRegisters = 4;
inline constexpr std::uint8_t kWriteCoil = 5;
inline constexpr std::uint8_t kWriteRegister = 6;
inline constexpr std::uint8_t kWriteCoils = 15;
inline constexpr std::uint8_t kWriteRegisters = 16;
/// Set over the function of a request, it makes the function of an exception reply.
inline constexpr std::uint8_t kExceptionBit = 0x80;

constexpr bool isRead(std::uint8_t function) {
    return function >= kReadCoils && function <= kReadInputRegisters;
}

/// Whether a request carries one item and its reply repeats it.
constexpr bool isSingleWrite(std::uint8_t function) {
    return function == kWriteCoil || function == kWriteRegister;
}

/// The address that every slave listens to and none answers.
inline constexpr std::uint8_t kBroadcastNode = 0;
/// No slave has it; an override to it takes a node out of service.
inline constexpr std::uint8_t kDisabledNode = 0xFF;

/// Bytes of an RTU frame, node and CRC included. Source: Modbus over Serial Line V1.02, 2.5.1.
inline constexpr int kMaxFrame = 256;
/// The shortest reply, an exception: node, function, code and CRC.
inline constexpr int kMinFrame = 1 + 1 + 1 + 2;
/// Bytes of a message without its check: node, function and body.
inline constexpr int kMaxMessage = kMaxFrame - 2;
/// Characters of an ASCII frame: colon, two for each byte and for the LRC, CR, LF.
inline constexpr int kMaxAsciiFrame = 1 + 2 * (kMaxMessage + 1) + 2;
inline constexpr int kMinAsciiFrame = 1 + 2 * (1 + 1 + 1) + 2;

}  // namespace _MRTU
