// How long frames are, told by their first bytes. Pure.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "wire/Bytes.h"

namespace wire {

/// How long an RTU request is, check included.
/// @param firstBytes  The node and what has come behind it.
/// @param longAt      Whether the request's node has a 32-bit register at its address.
/// @return nothing when more bytes are needed or the function is unknown.
std::optional<std::size_t> lengthOfRequest(ByteView firstBytes, bool longAt);

/// The start address of a request that begins with its node; nothing when it is not there yet.
std::optional<std::uint16_t> addressOfRequest(ByteView firstBytes);

}  // namespace wire
