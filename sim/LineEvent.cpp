#include "sim/LineEvent.h"

#include "wire/Hex.h"

namespace sim {
namespace {

using wire::ByteView;
using wire::Mode;

/// What cannot be printed becomes a point: the bytes come from outside.
std::string characters(ByteView bytes) {
    std::string text;
    for (const std::uint8_t byte : bytes) {
        if (byte == '\r' || byte == '\n') continue;
        text.push_back(byte >= 0x20 && byte < 0x7F ? static_cast<char>(byte) : '.');
    }
    return text;
}

}  // namespace

const char* nameOf(LineEvent::Kind kind) {
    switch (kind) {
        case LineEvent::Kind::Request:
            return "request";
        case LineEvent::Kind::Damaged:
            return "damaged";
        case LineEvent::Kind::Reply:
            return "reply";
        case LineEvent::Kind::Lost:
            return "lost";
        case LineEvent::Kind::HangUp:
            return "hang-up";
    }
    return "unknown";
}

std::string describe(const LineEvent& event, Mode mode) {
    const std::string bytes = mode == Mode::Rtu ? wire::hexText(event.raw) : characters(event.raw);
    return nameOf(event.kind) + (bytes.empty() ? "" : " " + bytes);
}

}  // namespace sim
