// Requests with their replies, as tests of both framings take them.
// Golden frames: Modbus Application Protocol V1.1b3, 6.
#pragma once

#include <string>

#include "wire/Framing.h"
#include "wire/Hex.h"
#include "wire/Replies.h"

namespace wire {

inline constexpr Mode kModes[] = {Mode::Rtu, Mode::Ascii};

struct Exchange {
    Bytes request;  // Messages, without their checks.
    Bytes reply;
};

inline const Exchange kExchanges[] = {
    {{1, 1, 0, 0x13, 0, 0x13}, {1, 1, 3, 0xCD, 0x6B, 0x05}},
    {{1, 2, 0, 0xC4, 0, 0x16}, {1, 2, 3, 0xAC, 0xDB, 0x35}},
    {{1, 3, 0, 0x6B, 0, 3}, {1, 3, 6, 2, 0x2B, 0, 0, 0, 0x64}},
    {{1, 4, 0, 8, 0, 1}, {1, 4, 2, 0, 0x0A}},
    {{1, 5, 0, 0xAC, 0xFF, 0}, {1, 5, 0, 0xAC, 0xFF, 0}},
    {{1, 6, 0, 1, 0, 3}, {1, 6, 0, 1, 0, 3}},
    {{1, 15, 0, 0x13, 0, 0x0A, 2, 0xCD, 1}, {1, 15, 0, 0x13, 0, 0x0A}},
    {{1, 16, 0, 1, 0, 2, 4, 0, 0x0A, 1, 2}, {1, 16, 0, 1, 0, 2}},
    // 32-bit registers.
    {{1, 3, 0x13, 0x88, 0, 2}, {1, 3, 8, 0, 1, 2, 3, 4, 5, 6, 7}},
    {{1, 6, 0x13, 0x88, 0, 1, 2, 3}, {1, 6, 0x13, 0x88, 0, 1, 2, 3}},
};

inline const Bytes kRead{1, 3, 0, 0x6B, 0, 3};
inline const Bytes kReadReply{1, 3, 6, 2, 0x2B, 0, 0, 0, 0x64};

inline Request requestOf(Mode mode, const Bytes& message) {
    return requestIn(encodeFrame(mode, message)).value();
}

/// The message with one byte replaced.
inline Bytes with(Bytes message, std::size_t at, std::uint8_t byte) {
    message.at(at) = byte;
    return message;
}

inline std::string nameOf(Mode mode, const Bytes& request) {
    return (mode == Mode::Rtu ? "RTU " : "ASCII ") + hexText(request);
}

inline Bytes exceptionOf(const Bytes& request) {
    return {request[0], static_cast<std::uint8_t>(request[1] | kExceptionFlag), 2};
}

}  // namespace wire
