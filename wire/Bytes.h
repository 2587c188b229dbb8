// The words for bytes on a line.
#pragma once

#include <cstdint>
#include <span>
#include <vector>

namespace wire {

using Bytes = std::vector<std::uint8_t>;
using ByteView = std::span<const std::uint8_t>;

/// How frames travel. Source: Modbus over Serial Line V1.02, 2.5.
enum class Mode : std::uint8_t { Rtu, Ascii };

}  // namespace wire
