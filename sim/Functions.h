// The function codes of Modbus on one node's memory. Pure.
#pragma once

#include <cstdint>

#include "sim/Memory.h"
#include "wire/Bytes.h"

namespace sim {

/// Source of the codes: Modbus Application Protocol V1.1b3, 7.
enum class Exception : std::uint8_t {
    IllegalFunction = 1,
    IllegalDataAddress = 2,
    IllegalDataValue = 3,
};

/// Executes a request.
/// @param request  Function and data, without node and check; at least the function.
/// @return the reply in the same form, perhaps an exception. `memory` changes only when the
/// request is valid as a whole.
wire::Bytes execute(Memory& memory, wire::ByteView request);

/// @return the reply that carries an exception code.
wire::Bytes exceptionReply(std::uint8_t function, std::uint8_t code);

/// Whether the function changes memory, so that it may be broadcast.
bool isWrite(std::uint8_t function);

}  // namespace sim
