// Takes apart the control sequences of the keys.
#include "cli/poll/KeyDecoder.h"

#include <array>

namespace cli {
namespace {

/// What a sequence of bytes is: how many it takes, and the key if it is one.
struct Step {
    std::size_t bytes = 0;  ///< 0: the rest is missing.
    std::optional<Key> key{};
};

struct SequenceRow {
    std::string_view rest;  ///< Behind "ESC [" or "ESC O".
    KeyKind kind;
};

// Source: xterm control sequences, "PC-Style Function Keys" and "VT220-Style Function Keys".
constexpr std::array kSequences{
    SequenceRow{"A", KeyKind::Up},      SequenceRow{"B", KeyKind::Down},
    SequenceRow{"5~", KeyKind::PageUp}, SequenceRow{"6~", KeyKind::PageDown},
    SequenceRow{"H", KeyKind::Home},    SequenceRow{"1~", KeyKind::Home},
    SequenceRow{"7~", KeyKind::Home},   SequenceRow{"F", KeyKind::End},
    SequenceRow{"4~", KeyKind::End},    SequenceRow{"8~", KeyKind::End},
};

constexpr char kEscape = '\x1B';
/// No key sends more; what does is thrown away.
constexpr std::size_t kLongestSequence = 32;

std::optional<Key> keyOf(std::string_view rest) {
    for (const SequenceRow& row : kSequences) {
        if (row.rest == rest) return Key{row.kind, {}};
    }
    return {};
}

bool endsSequence(char byte) {
    return byte >= '@' && byte <= '~';
}

Step sequence(std::string_view bytes) {
    if (bytes.size() == 1) return {};
    if (bytes[1] != '[' && bytes[1] != 'O') return {1, Key{KeyKind::Escape, {}}};
    for (std::size_t i = 2; i < bytes.size(); ++i) {
        if (endsSequence(bytes[i])) return {i + 1, keyOf(bytes.substr(2, i - 1))};
        if (i == kLongestSequence) return {i + 1};
    }
    return {};
}

std::size_t bytesOfCharacter(unsigned char lead) {
    if (lead < 0xC0) return 1;
    if (lead < 0xE0) return 2;
    return lead < 0xF0 ? 3 : 4;
}

Step character(std::string_view bytes) {
    const auto lead = static_cast<unsigned char>(bytes[0]);
    const std::size_t length = bytesOfCharacter(lead);
    if (bytes.size() < length) return {};
    return {length, Key{KeyKind::Character, std::string(bytes.substr(0, length))}};
}

Step firstKey(std::string_view bytes) {
    switch (bytes[0]) {
        case kEscape:
            return sequence(bytes);
        case '\r':
        case '\n':
            return {1, Key{KeyKind::Enter, {}}};
        case '\b':
        case '\x7F':
            return {1, Key{KeyKind::Backspace, {}}};
        case '\f':
            return {1, Key{KeyKind::Redraw, {}}};
        default:
            break;
    }
    if (static_cast<unsigned char>(bytes[0]) < 0x20) return {1};
    return character(bytes);
}

}  // namespace

std::vector<Key> KeyDecoder::feed(std::string_view bytes) {
    std::vector<Key> keys;
    pending_ += bytes;
    while (!pending_.empty()) {
        const Step step = firstKey(pending_);
        if (step.bytes == 0) break;
        if (step.key) keys.push_back(*step.key);
        pending_.erase(0, step.bytes);
    }
    return keys;
}

std::optional<Key> KeyDecoder::idle() {
    const bool alone = pending_.size() == 1 && pending_[0] == kEscape;
    pending_.clear();
    if (!alone) return {};
    return Key{KeyKind::Escape, {}};
}

}  // namespace cli
