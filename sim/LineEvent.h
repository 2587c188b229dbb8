// What happened on the simulated line, for tests and for people.
#pragma once

#include <chrono>
#include <string>

#include "wire/Bytes.h"

namespace sim {

/// Something that happened on the line.
struct LineEvent {
    enum class Kind : std::uint8_t {
        Request,  ///< A frame with a right check, for whatever node.
        Damaged,  ///< Bytes that are no frame; they stay unanswered.
        Reply,    ///< What was sent, faults included.
        Lost,     ///< A request to a node that was busy, see SimulatorOptions::losesWhileBusy.
        HangUp,   ///< A fault ended the line; no bytes.
    };
    Kind kind = Kind::Request;
    wire::Bytes raw;  ///< As on the line: RTU bytes or ASCII characters, check included.
    std::chrono::steady_clock::time_point at{};
};

/// @return the kind's name: "request", "damaged", "reply", "lost", "hang-up".
const char* nameOf(LineEvent::Kind kind);

/// @return one line of text: the kind's name, then the bytes in hexadecimal (RTU) or the characters
/// without CR and LF (ASCII, a point for what cannot be printed). `request 01 03 00 00 00 01 84
/// 0A`.
std::string describe(const LineEvent& event, wire::Mode mode);

}  // namespace sim
