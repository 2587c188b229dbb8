// Modbus frames in both transmission modes: bytes in, bytes out; no port, no clock, no lock.
//
// Multi-byte values are most significant byte first, except the CRC, whose low byte comes first.
// Source: Modbus over Serial Line V1.02, 2.5.1 (RTU) and 2.5.2 (ASCII).
#pragma once

#include <array>
#include <cstdint>
#include <span>

#include "mrtu/ModbusNumbers.h"

/// The Modbus CRC-16 (initial value 0xFFFF, polynomial 0xA001 reflected) with its two bytes
/// exchanged, so that it equals (frame[n-2] << 8) | frame[n-1] of a correct frame.
std::uint16_t calcCRC(const unsigned char* data, int length);

namespace _MRTU {

using ByteView = std::span<const std::uint8_t>;

/// A request without its check, built front to back.
class Message {
  public:
    /// REQUIRES: room for the byte, see fits().
    void put(std::uint8_t byte) { bytes_[static_cast<std::size_t>(length_++)] = byte; }
    void putWord(std::uint16_t word);
    /// Appends `count` zeros for the caller to write over; valid as long as the message.
    /// REQUIRES: room for them, see fits().
    std::uint8_t* extend(int count) {
        length_ += count;
        return bytes_.data() + length_ - count;
    }
    bool fits(long long count) const { return count >= 0 && count <= kMaxMessage - length_; }

    ByteView view() const { return {bytes_.data(), static_cast<std::size_t>(length_)}; }
    std::uint8_t operator[](std::size_t index) const { return bytes_[index]; }
    std::uint8_t node() const { return bytes_[0]; }
    std::uint8_t function() const { return bytes_[1]; }
    int length() const { return length_; }

  private:
    std::array<std::uint8_t, kMaxMessage> bytes_{};
    int length_ = 0;
};

/// A frame ready to be sent.
struct Frame {
    std::array<std::uint8_t, kMaxAsciiFrame> bytes;
    int length = 0;
};

Frame frameRtu(ByteView message);
Frame frameAscii(ByteView message);

/// Copies items from the host's byte order, least significant byte first, to the line's, most
/// significant byte first, or back. A count below 1 copies nothing.
void turnItems(unsigned char* to, const unsigned char* from, int count, int itemLength);

/// The two's complement of the 8-bit sum.
std::uint8_t calcLrc(ByteView data);

/// Whether the last two bytes of a frame of more than 4 are the CRC of those before.
bool isGoodRtuFrame(ByteView frame);

/// The bytes of an ASCII frame, LRC included.
struct AsciiBytes {
    std::array<std::uint8_t, kMaxFrame> bytes{};
    int length = 0;
    bool wellFormed = false;  ///< Colon in front, more than 8 characters, only 0-9 and A-F.
};

/// Decodes up to the last two characters, which stand for CR and LF and are not looked at.
/// REQUIRES: at most 513 characters.
AsciiBytes decodeAscii(ByteView characters);

/// Whether the last byte is the LRC of those before.
bool isGoodAsciiFrame(const AsciiBytes& decoded);

}  // namespace _MRTU
