#include "wire/Hex.h"

namespace wire {

std::optional<std::uint8_t> hexValue(std::uint8_t character) {
    const std::size_t value = kHexDigits.find(static_cast<char>(character));
    if (value == std::string_view::npos) return std::nullopt;
    return static_cast<std::uint8_t>(value);
}

void putHex(Bytes& out, std::uint8_t byte) {
    out.push_back(static_cast<std::uint8_t>(kHexDigits[byte >> 4U]));
    out.push_back(static_cast<std::uint8_t>(kHexDigits[byte & 0x0FU]));
}

std::optional<Bytes> fromHex(ByteView characters) {
    if (characters.size() % 2 != 0) return std::nullopt;
    Bytes bytes;
    for (std::size_t i = 0; i < characters.size(); i += 2) {
        const auto high = hexValue(characters[i]);
        const auto low = hexValue(characters[i + 1]);
        if (!high || !low) return std::nullopt;
        bytes.push_back(static_cast<std::uint8_t>(*high << 4U | *low));
    }
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
