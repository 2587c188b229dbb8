// The conversions that exchange bytes, by width.
#pragma once

#include <array>
#include <string_view>

namespace ProtUtilsN {

struct Swap {
    std::string_view name;
    int width;  ///< Bytes of the run-time form that change places among themselves.
};

inline constexpr std::array kSwaps{Swap{"swap2", 2}, Swap{"swap4", 4}, Swap{"swap8", 8}};

}  // namespace ProtUtilsN
