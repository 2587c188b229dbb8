#include "settings/NumberText.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <limits>

namespace settings {
namespace {

constexpr std::string_view kWhite = " \t\n\v\f\r";

bool isDigit(char c) {
    return std::isdigit(static_cast<unsigned char>(c)) != 0;
}

/// Chosen here, since newer libraries read "0b1" as a binary number when strtoll() chooses.
int baseOf(std::string_view text) {
    std::string_view digits = text.substr(std::min(text.find_first_not_of(kWhite), text.size()));
    if (digits.starts_with('-') || digits.starts_with('+')) digits.remove_prefix(1);
    if (!digits.starts_with('0')) return 10;
    return digits.starts_with("0x") || digits.starts_with("0X") ? 16 : 8;
}

}  // namespace

NumberReading readNumber(std::string_view text) {
    const std::string copy(text);
    char* end = nullptr;
    const long long number = std::strtoll(copy.c_str(), &end, baseOf(text));
    using Limits = std::numeric_limits<std::int32_t>;
    const long long value = std::clamp<long long>(number, Limits::min(), Limits::max());

    const std::string_view digits =
        !text.empty() && (text[0] == '-' || text[0] == '+') ? text.substr(1) : text;
    const bool octal = digits.size() > 1 && digits[0] == '0' && isDigit(digits[1]);
    const bool partial = end != copy.c_str() + copy.size() || copy.empty();
    return {static_cast<long>(value), octal, partial};
}

std::string withoutLeadingZeroes(std::string_view text) {
    const std::size_t first = std::min(text.find_first_not_of('0'), text.size());
    const std::string_view rest = text.substr(first);
    if (rest.empty() || !isDigit(rest[0])) return "0" + std::string(rest);
    return std::string(rest);
}

}  // namespace settings
