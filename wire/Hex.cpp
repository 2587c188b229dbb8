#include "wire/Hex.h"

namespace wire {

std::optional<std::uint8_t> hexValue(std::uint8_t character) {
    if (character >= '0' && character <= '9') return static_cast<std::uint8_t>(character - '0');
    if (character >= 'A' && character <= 'F')
        return static_cast<std::uint8_t>(character - 'A' + 10);
    return std::nullopt;
}

void putHex(Bytes& out, std::uint8_t byte) {
    out.push_back(static_cast<std::uint8_t>(kHexDigits[byte >> 4U]));
    out.push_back(static_cast<std::uint8_t>(kHexDigits[byte & 0x0FU]));
}

std::optional<std::size_t> bytesInHex(ByteView characters, std::span<std::uint8_t> room) {
    const std::size_t count = characters.size() / 2;
    if (characters.size() % 2 != 0 || count > room.size()) return std::nullopt;
    for (std::size_t i = 0; i < count; ++i) {
        const auto high = hexValue(characters[2 * i]);
        const auto low = hexValue(characters[2 * i + 1]);
        if (!high || !low) return std::nullopt;
        room[i] = static_cast<std::uint8_t>(*high << 4U | *low);
    }
    return count;
}

std::optional<Bytes> fromHex(ByteView characters) {
    Bytes bytes(characters.size() / 2);
    if (!bytesInHex(characters, bytes)) return std::nullopt;
    return bytes;
}

std::string hexText(ByteView bytes, std::string_view between) {
    Bytes digits;
    for (const std::uint8_t byte : bytes) {
        if (!digits.empty()) digits.insert(digits.end(), between.begin(), between.end());
        putHex(digits, byte);
    }
    return {digits.begin(), digits.end()};
}

}  // namespace wire
