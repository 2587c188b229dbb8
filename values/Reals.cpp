// The floating-point half of Numbers.h.
#include <fmt/format.h>

#include <array>
#include <bit>
#include <charconv>
#include <cmath>
#include <limits>

#include "values/Numbers.h"
#include "values/ValueError.h"

namespace values {
namespace {

template <typename Real>
struct Pattern;
template <>
struct Pattern<float> {
    using Bits = std::uint32_t;
};
template <>
struct Pattern<double> {
    using Bits = std::uint64_t;
};

[[noreturn]] void refuse(std::string_view text, std::string_view what, std::string_view type) {
    throw ValueError(fmt::format("'{}' is {} {}", text, what, type));
}

template <typename Real>
typename Pattern<Real>::Bits parseNan(std::string_view text, std::string_view type) {
    using Bits = typename Pattern<Real>::Bits;
    const Bits plain = std::bit_cast<Bits>(std::numeric_limits<Real>::quiet_NaN());
    if (text == "nan") return plain;
    if (text == "-nan") return plain | Bits{1} << (std::numeric_limits<Bits>::digits - 1);
    constexpr std::string_view kFront = "nan(0x";
    if (!text.starts_with(kFront) || !text.ends_with(')')) refuse(text, "no number for", type);
    const char* const first = text.data() + kFront.size();
    const char* const last = text.data() + text.size() - 1;
    Bits bits = 0;
    const auto [stop, error] = std::from_chars(first, last, bits, 16);
    const bool whole = error == std::errc{} && stop == last;
    if (!whole || !std::isnan(std::bit_cast<Real>(bits))) refuse(text, "no NaN pattern of", type);
    return bits;
}

/// Tells whether a number that was read as zero was written as zero.
bool writtenAsZero(std::string_view digits, bool hex) {
    const std::string_view mantissa = digits.substr(0, digits.find_first_of(hex ? "pP" : "eE"));
    return mantissa.find_first_not_of("0.") == std::string_view::npos;
}

template <typename Real>
typename Pattern<Real>::Bits parsePattern(std::string_view text, std::string_view type) {
    using Bits = typename Pattern<Real>::Bits;
    if (text.find("nan") != std::string_view::npos) return parseNan<Real>(text, type);
    std::string_view digits = text;
    const bool negative = digits.starts_with('-');
    if (negative || digits.starts_with('+')) digits.remove_prefix(1);
    const bool hex = digits.starts_with("0x") || digits.starts_with("0X");
    if (hex) digits.remove_prefix(2);
    if (digits.starts_with('-')) refuse(text, "no number for", type);

    Real value = 0;
    const char* const end = digits.data() + digits.size();
    const auto format = hex ? std::chars_format::hex : std::chars_format::general;
    const auto [stop, error] = std::from_chars(digits.data(), end, value, format);
    const bool infinity = !hex && digits == "inf";
    if (error == std::errc::invalid_argument || stop != end || std::isnan(value) ||
        (std::isinf(value) && !infinity && digits.find_first_of("iI") == 0)) {
        refuse(text, "no number for", type);
    }
    // The standard libraries do not agree on which of the three tells of a number out of range.
    const bool lost = error != std::errc{} || (std::isinf(value) && !infinity) ||
                      (value == 0 && !writtenAsZero(digits, hex));
    if (lost) refuse(text, "out of range for", type);
    return std::bit_cast<Bits>(negative ? -value : value);
}

template <typename Real>
std::string formatPattern(typename Pattern<Real>::Bits bits) {
    const Real value = std::bit_cast<Real>(bits);
    if (std::isnan(value)) {
        for (const std::string_view plain : {"nan", "-nan"}) {
            if (parseNan<Real>(plain, {}) == bits) return std::string(plain);
        }
        return fmt::format("nan(0x{:0{}x})", bits, 2 * sizeof bits);
    }
    std::array<char, 64> text{};
    const auto [end, error] = std::to_chars(text.data(), text.data() + text.size(), value);
    return {text.data(), end};
}

}  // namespace

std::uint64_t parseReal(const ValueType& type, std::string_view text) {
    const std::string_view number = trimmed(text);
    return type.bytes == 4 ? parsePattern<float>(number, type.name)
                           : parsePattern<double>(number, type.name);
}

std::string formatReal(const ValueType& type, std::uint64_t bits) {
    return type.bytes == 4 ? formatPattern<float>(static_cast<std::uint32_t>(bits))
                           : formatPattern<double>(bits);
}

}  // namespace values
