// Numbers and times in the texts that people write. Pure.
#pragma once

#include <charconv>
#include <string_view>
#include <system_error>

#include "sim/Pacing.h"

namespace sim {

/// Reads a whole text as a decimal number. @return whether it is one from `min` to `max`; else
/// `out` keeps what it holds.
template <typename Number>
bool readNumber(std::string_view text, Number min, Number max, Number& out) {
    Number number{};
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc{} || stop != end || number < min || number > max) return false;
    out = number;
    return true;
}

/// The longest time that a text may name: an hour, as for the delay of a fault.
inline constexpr Nanos kLongestTime = std::chrono::hours(1);

/// Reads a whole text as a time: "20", "1.75", with up to three digits behind the point.
/// @param unit  Of the text's number, at least 1 us.
/// @return whether it is one from 0 to kLongestTime; else `out` keeps what it holds.
bool readTime(std::string_view text, Nanos unit, Nanos& out);

}  // namespace sim
