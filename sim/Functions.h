// The function codes of Modbus on one node's memory. Pure.
#pragma once

#include <optional>

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

/// How long an RTU request is, check included, judged by its first bytes.
/// @param longAt  Whether the request's node has a 32-bit register at its address.
/// @return nothing when more bytes are needed or the function is unknown.
std::optional<std::size_t> lengthOfRequest(wire::ByteView firstBytes, bool longAt);

/// The start address of a request that begins with its node; nothing when it is not there yet.
std::optional<std::uint16_t> addressOfRequest(wire::ByteView firstBytes);

}  // namespace sim
