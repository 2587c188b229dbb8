#include "tests/support/ByteTexts.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace testing_support {

namespace {

constexpr std::string_view kDigits = "0123456789ABCDEF";

int nibble(char digit) {
    const char upper = digit >= 'a' ? static_cast<char>(digit - 'a' + 'A') : digit;
    const auto value = kDigits.find(upper);
    if (value == std::string_view::npos) {
        ADD_FAILURE() << "no hexadecimal digit: " << digit;
        return 0;
    }
    return static_cast<int>(value);
}

}  // namespace

Bytes hex(std::string_view text) {
    std::string digits(text);
    std::erase(digits, ' ');
    if (digits.size() % 2 != 0) ADD_FAILURE() << "odd number of digits: " << text;
    Bytes bytes;
    for (std::size_t i = 0; i + 1 < digits.size(); i += 2)
        bytes.push_back(static_cast<std::uint8_t>(nibble(digits[i]) * 16 + nibble(digits[i + 1])));
    return bytes;
}

Bytes characters(std::string_view text) {
    return {text.begin(), text.end()};
}

std::string toHex(const Bytes& bytes) {
    std::string text;
    for (const std::uint8_t byte : bytes) {
        if (!text.empty()) text += ' ';
        text += kDigits[byte >> 4];
        text += kDigits[byte & 0x0F];
    }
    return text;
}

Bytes operator+(const Bytes& front, const Bytes& back) {
    Bytes both = front;
    both.insert(both.end(), back.begin(), back.end());
    return both;
}

Bytes withByte(Bytes bytes, std::size_t index, std::uint8_t value) {
    bytes.at(index) = value;
    return bytes;
}

Bytes firstOf(const Bytes& bytes, std::size_t count) {
    return {bytes.begin(),
            bytes.begin() + static_cast<std::ptrdiff_t>(std::min(count, bytes.size()))};
}

}  // namespace testing_support
