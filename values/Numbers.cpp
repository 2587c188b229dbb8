#include "values/Numbers.h"

#include <fmt/format.h>

#include <charconv>
#include <limits>

#include "values/ValueError.h"

namespace values {
namespace {

[[noreturn]] void refuse(std::string_view text, std::string_view what, std::string_view type) {
    throw ValueError(fmt::format("'{}' is {} ({})", text, what, type));
}

[[noreturn]] void refuseRange(std::string_view text, const ValueType& type) {
    throw ValueError(
        fmt::format("'{}' is out of range for {} ({})", text, type.name, rangeText(type)));
}

/// Takes a sign off the front. @return true for minus.
bool takeSign(std::string_view& text) {
    if (text.empty() || (text.front() != '-' && text.front() != '+')) return false;
    const bool negative = text.front() == '-';
    text.remove_prefix(1);
    return negative;
}

bool takeHexPrefix(std::string_view& text) {
    if (!text.starts_with("0x") && !text.starts_with("0X")) return false;
    text.remove_prefix(2);
    return true;
}

std::uint64_t largestMagnitude(const ValueType& type, bool negative) {
    const unsigned bits = 8U * type.bytes;
    if (type.kind == ValueKind::Signed) {
        return (std::uint64_t{1} << (bits - 1)) - (negative ? 0 : 1);
    }
    return negative ? 0 : std::numeric_limits<std::uint64_t>::max() >> (64 - bits);
}

}  // namespace

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string_view::npos) return {};
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

std::uint64_t parseBoolean(std::string_view text) {
    const std::string_view word = trimmed(text);
    if (word == "1" || word == "true") return 1;
    if (word == "0" || word == "false") return 0;
    refuse(word, "none of 0, 1, false and true", "boolean");
}

std::uint64_t parseWhole(const ValueType& type, std::string_view text) {
    const std::string_view whole = trimmed(text);
    std::string_view digits = whole;
    const bool negative = takeSign(digits);
    const int base = takeHexPrefix(digits) ? 16 : 10;
    // from_chars() takes a sign of its own for signed types only: "--1" fails here.
    std::uint64_t magnitude = 0;
    const char* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, magnitude, base);
    if (error == std::errc::invalid_argument || stop != end) {
        refuse(whole, "no whole number", type.name);
    }
    if (error != std::errc{} || magnitude > largestMagnitude(type, negative)) {
        refuseRange(whole, type);
    }
    return negative ? std::uint64_t{0} - magnitude : magnitude;
}

std::string formatWhole(const ValueType& type, std::uint64_t bits) {
    const bool negative =
        type.kind == ValueKind::Signed && (bits >> (8U * type.bytes - 1) & 1) != 0;
    if (!negative) return std::to_string(bits);
    const std::uint64_t mask = largestMagnitude(kValueTypes[22], false) >> (64 - 8U * type.bytes);
    return "-" + std::to_string((~bits & mask) + 1);
}

std::string rangeText(const ValueType& type) {
    const std::uint64_t low = largestMagnitude(type, true);
    return fmt::format("{}{}..{}", low == 0 ? "" : "-", low, largestMagnitude(type, false));
}

}  // namespace values
