// How the driver family reads an integer, and what a person may not expect of that. Pure.
#pragma once

#include <string>
#include <string_view>

namespace settings {

/// An integer read with automatic base: "0x" hexadecimal, a leading zero octal, else decimal.
struct NumberReading {
    long value;    ///< What the driver gets: 0 without digits, the nearest 32-bit number if beyond.
    bool octal;    ///< A leading zero with more digits behind it.
    bool partial;  ///< Characters behind the number, or the lack of one, went unnoticed.
};

NumberReading readNumber(std::string_view text);

/// @return the text without sign-less leading zeroes, e.g. "100" for "0100", "0" for "00".
std::string withoutLeadingZeroes(std::string_view text);

}  // namespace settings
