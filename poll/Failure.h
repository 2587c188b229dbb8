// What a driver's error says of the line, the node and the block. Pure; the one place that knows
// the driver's codes and texts.
#pragma once

#include <cstdint>

#include "poll/BlockReader.h"

namespace poll {

enum class FailureKind {
    None,
    Timeout,    ///< Nothing came.
    Check,      ///< Something came, but not a sound reply: noise.
    Refusal,    ///< The device does not have what was asked for: exceptions 1 to 3.
    Exception,  ///< Any other exception: the device is there, and may answer next time.
    Unreached,  ///< A gateway on the way answered in the node's place: exceptions 10 and 11.
    NotSent,    ///< The driver did not ask: disabled, not started, or the port can't be used.
    Value,      ///< The device answered; its value could not be used.
};

struct Failure {
    FailureKind kind = FailureKind::None;
    std::uint8_t exception = 0;  ///< Its code; 0 when there is none or the driver does not tell it.

    /// The device itself answered, with whatever.
    [[nodiscard]] bool heard() const;
    /// Speaks against the node: such failures in a row make it unreachable.
    [[nodiscard]] bool againstNode() const;
    /// A sound reply came: counted as one.
    [[nodiscard]] bool replied() const { return heard() || kind == FailureKind::Unreached; }
};

/// @param error  Code 0: there is none.
Failure classify(const ReadError& error);

}  // namespace poll
