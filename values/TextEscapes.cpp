#include "values/TextEscapes.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <charconv>

#include "values/ValueError.h"

namespace values {
namespace {

struct Escape {
    char letter;
    char byte;
};
constexpr std::array kEscapes{Escape{'n', '\n'}, Escape{'r', '\r'},  Escape{'t', '\t'},
                              Escape{'0', '\0'}, Escape{'\\', '\\'}, Escape{'"', '"'}};

struct Utf8Row {
    std::uint8_t mask;
    std::uint8_t lead;
    std::size_t length;
    std::uint32_t smallest;
};
constexpr std::array kUtf8{Utf8Row{0x80, 0x00, 1, 0}, Utf8Row{0xE0, 0xC0, 2, 0x80},
                           Utf8Row{0xF0, 0xE0, 3, 0x800}, Utf8Row{0xF8, 0xF0, 4, 0x10000}};

bool isControl(ByteView character) {
    if (character.size() == 1) return character[0] < 0x20 || character[0] == 0x7F;
    // U+0080..U+009F: terminals act on them.
    return character.size() == 2 && character[0] == 0xC2 && character[1] < 0xA0;
}

const Escape* escapeOf(std::uint8_t byte) {
    for (const Escape& escape : kEscapes) {
        if (static_cast<std::uint8_t>(escape.byte) == byte) return &escape;
    }
    return nullptr;
}

[[noreturn]] void refuse(std::string_view text, std::string_view why) {
    throw ValueError(fmt::format("text '{}': {}", text, why));
}

/// Reads what follows a backslash at `at` and moves `at` behind it.
std::uint8_t takeEscape(std::string_view text, std::size_t& at) {
    if (at + 1 >= text.size()) refuse(text, "a lone backslash at its end (write \\\\)");
    const char letter = text[at + 1];
    for (const Escape& escape : kEscapes) {
        if (escape.letter != letter) continue;
        at += 2;
        return static_cast<std::uint8_t>(escape.byte);
    }
    if (letter != 'x') refuse(text, fmt::format("unknown escape \\{}", letter));
    const std::string_view digits = text.substr(at + 2, 2);
    std::uint8_t byte = 0;
    const char* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, byte, 16);
    if (digits.size() != 2 || error != std::errc{} || stop != end) {
        refuse(text, "\\x needs two hexadecimal digits");
    }
    at += 4;
    return byte;
}

}  // namespace

std::size_t utf8Length(ByteView bytes) {
    if (bytes.empty()) return 0;
    for (const Utf8Row& row : kUtf8) {
        if ((bytes[0] & row.mask) != row.lead) continue;
        if (bytes.size() < row.length) return 0;
        std::uint32_t code = bytes[0] & static_cast<std::uint8_t>(~row.mask);
        for (std::size_t i = 1; i < row.length; ++i) {
            if ((bytes[i] & 0xC0) != 0x80) return 0;
            code = code << 6 | (bytes[i] & 0x3FU);
        }
        const bool surrogate = code >= 0xD800 && code <= 0xDFFF;
        return code < row.smallest || code > 0x10FFFF || surrogate ? 0 : row.length;
    }
    return 0;
}

std::size_t utf8Length(std::string_view text) {
    std::array<std::uint8_t, 4> bytes{};  // No character has more.
    const std::size_t count = std::min(bytes.size(), text.size());
    std::copy_n(text.begin(), count, bytes.begin());
    return utf8Length(ByteView(bytes).first(count));
}

std::string escapeText(ByteView bytes) {
    std::string text;
    for (std::size_t at = 0; at < bytes.size();) {
        const std::size_t length = utf8Length(bytes.subspan(at));
        const ByteView character = bytes.subspan(at, length);
        if (const Escape* escape = escapeOf(bytes[at])) {
            text += {'\\', escape->letter};
            ++at;
        } else if (length == 0 || isControl(character)) {
            text += fmt::format("\\x{:02x}", bytes[at]);
            ++at;
        } else {
            text.append(character.begin(), character.end());
            at += length;
        }
    }
    return text;
}

std::string printableText(std::string_view text) {
    const Bytes bytes(text.begin(), text.end());
    std::string shown;
    for (std::size_t at = 0; at < bytes.size();) {
        const std::size_t length = utf8Length(ByteView(bytes).subspan(at));
        if (length == 0 || isControl(ByteView(bytes).subspan(at, length))) {
            shown += fmt::format("\\x{:02x}", bytes[at++]);
        } else {
            shown.append(text.substr(at, length));
            at += length;
        }
    }
    return shown;
}

Bytes unescapeText(std::string_view text) {
    const bool quoted = text.starts_with('"');
    Bytes bytes;
    for (std::size_t at = quoted ? 1 : 0; at < text.size();) {
        if (text[at] == '\\') {
            bytes.push_back(takeEscape(text, at));
        } else if (quoted && text[at] == '"') {
            if (at + 1 != text.size()) refuse(text, "something stands behind the closing quote");
            return bytes;
        } else {
            bytes.push_back(static_cast<std::uint8_t>(text[at++]));
        }
    }
    if (quoted) refuse(text, "the closing quote is missing");
    return bytes;
}

}  // namespace values
