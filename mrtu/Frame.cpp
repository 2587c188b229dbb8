#include "mrtu/Frame.h"

#include <algorithm>
#include <numeric>

namespace _MRTU {

namespace {

constexpr std::uint16_t kCrcStart = 0xFFFF;
constexpr std::uint16_t kCrcPolynomial = 0xA001;

// The register after all bytes; its low byte goes on the line first.
std::uint16_t crcRegister(ByteView data) {
    unsigned crc = kCrcStart;
    for (const std::uint8_t byte : data) {
        crc ^= byte;
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc & 1u) != 0 ? (crc >> 1) ^ kCrcPolynomial : crc >> 1;
    }
    return static_cast<std::uint16_t>(crc);
}

constexpr std::uint8_t low(unsigned word) {
    return static_cast<std::uint8_t>(word & 0xFFu);
}

constexpr std::uint8_t high(unsigned word) {
    return static_cast<std::uint8_t>((word >> 8) & 0xFFu);
}

void append(Frame& frame, std::uint8_t byte) {
    frame.bytes[static_cast<std::size_t>(frame.length++)] = byte;
}

void appendHex(Frame& frame, std::uint8_t byte) {
    constexpr char kDigits[] = "0123456789ABCDEF";
    append(frame, static_cast<std::uint8_t>(kDigits[byte >> 4]));
    append(frame, static_cast<std::uint8_t>(kDigits[byte & 0x0F]));
}

void turnRegisters(unsigned char* to, const unsigned char* from, int count) {
    for (int byte = 0; byte < 2 * count; byte += 2) {
        to[byte] = from[byte + 1];
        to[byte + 1] = from[byte];
    }
}

bool isHexDigit(std::uint8_t character) {
    return (character >= '0' && character <= '9') || (character >= 'A' && character <= 'F');
}

std::uint8_t nibble(std::uint8_t character) {
    return low(character > '9' ? character - 0x37u : character - 0x30u);
}

}  // namespace

void Message::putWord(std::uint16_t word) {
    put(high(word));
    put(low(word));
}

Frame frameRtu(ByteView message) {
    Frame frame;
    std::copy(message.begin(), message.end(), frame.bytes.begin());
    frame.length = static_cast<int>(message.size());
    const std::uint16_t crc = crcRegister(message);
    append(frame, low(crc));
    append(frame, high(crc));
    return frame;
}

Frame frameAscii(ByteView message) {
    Frame frame;
    append(frame, ':');
    for (const std::uint8_t byte : message)
        appendHex(frame, byte);
    appendHex(frame, calcLrc(message));
    append(frame, '\r');
    append(frame, '\n');
    return frame;
}

void turnItems(unsigned char* to, const unsigned char* from, int count, int itemLength) {
    if (itemLength == 2) return turnRegisters(to, from, count);
    for (; count > 0; --count, to += itemLength, from += itemLength)
        std::reverse_copy(from, from + itemLength, to);
}

std::uint8_t calcLrc(ByteView data) {
    return low(0u - std::accumulate(data.begin(), data.end(), 0u));
}

bool isGoodRtuFrame(ByteView frame) {
    if (frame.size() < static_cast<std::size_t>(kMinFrame)) return false;
    const ByteView check = frame.last(2);
    const auto received = static_cast<std::uint16_t>((check[0] << 8) | check[1]);
    return calcCRC(frame.data(), static_cast<int>(frame.size()) - 2) == received;
}

AsciiBytes decodeAscii(ByteView characters) {
    AsciiBytes decoded;
    if (characters.size() < static_cast<std::size_t>(kMinAsciiFrame) || characters[0] != ':')
        return decoded;
    // Colon, CR and LF aside; an odd character out is left alone.
    const std::size_t count = (characters.size() - 4) / 2 + 1;
    const ByteView digits = characters.subspan(1, 2 * count);
    for (std::size_t index = 0; index < count; ++index) {
        const unsigned upper = nibble(digits[2 * index]);
        const unsigned byte = (upper << 4) + nibble(digits[2 * index + 1]);
        decoded.bytes[index] = low(byte);
    }
    decoded.length = static_cast<int>(count);
    decoded.wellFormed = std::all_of(digits.begin(), digits.end(), isHexDigit);
    return decoded;
}

bool isGoodAsciiFrame(const AsciiBytes& decoded) {
    if (!decoded.wellFormed) return false;
    const ByteView bytes(decoded.bytes.data(), static_cast<std::size_t>(decoded.length));
    return calcLrc(bytes.first(bytes.size() - 1)) == bytes.back();
}

}  // namespace _MRTU

std::uint16_t calcCRC(const unsigned char* data, int length) {
    if (length < 0) length = 0;
    const std::uint16_t crc = _MRTU::crcRegister({data, static_cast<std::size_t>(length)});
    return static_cast<std::uint16_t>((_MRTU::low(crc) << 8) | _MRTU::high(crc));
}
