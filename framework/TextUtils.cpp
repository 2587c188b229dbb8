// Small text utilities: trimming, splitting, key look-up, integers and bounded copies.
#include "framework/TextUtils.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <string_view>

namespace ProtUtilsN {

namespace {

constexpr std::string_view kTrimmed = " \t";

bool isLetterOrDigit(char c) {
    return isDecimalDigit(c) || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

// strtol() has 64 bits on one architecture and 32 on the other: the clamp makes both agree.
std::int32_t parseClamped(const char* text, int base) {
    using Limits = std::numeric_limits<std::int32_t>;
    const long value = std::strtol(text, nullptr, base);
    return static_cast<std::int32_t>(std::clamp<long>(value, Limits::min(), Limits::max()));
}

// Chosen here, since newer libraries read "0b1" as a binary number when strtol() chooses.
int baseOf(const char* text) {
    while (isWhiteSpace(*text)) {
        ++text;
    }
    if (*text == '+' || *text == '-') ++text;
    if (*text != '0') return 10;
    return text[1] == 'x' || text[1] == 'X' ? 16 : 8;
}

}  // namespace

bool isWhiteSpace(char c) {
    return c == ' ' || (c >= '\t' && c <= '\r');
}

bool isDecimalDigit(char c) {
    return c >= '0' && c <= '9';
}

void Trim(std::string& text) {
    const std::size_t last = text.find_last_not_of(kTrimmed);
    text.erase(last == std::string::npos ? 0 : last + 1);
    text.erase(0, text.find_first_not_of(kTrimmed));
}

std::string GetTrim(const std::string& text) {
    std::string trimmed = text;
    Trim(trimmed);
    return trimmed;
}

std::string_view takePiece(std::string_view& rest, char delimiter, bool& more) {
    const std::size_t end = rest.find(delimiter);
    more = end != std::string_view::npos;
    const std::string_view piece = rest.substr(0, end);
    rest.remove_prefix(more ? end + 1 : rest.size());
    const std::size_t first = piece.find_first_not_of(kTrimmed);
    if (first == std::string_view::npos) return {};
    return piece.substr(first, piece.find_last_not_of(kTrimmed) + 1 - first);
}

void ParseSubstrings(const std::string& text, std::vector<std::string>& pieces, char delimiter) {
    std::string_view rest = text;
    for (bool more = true; more;)
        pieces.emplace_back(takePiece(rest, delimiter, more));
}

bool GetConfigValue(const char* text, const char* key, std::string& value) {
    const std::string item = std::string(key) + "=";
    const char* start = std::strstr(text, item.c_str());
    if (start == nullptr) return false;

    start += item.size();
    const char* end = start;
    while (isLetterOrDigit(*end)) {
        ++end;
    }
    value.assign(start, end);
    return true;
}

std::int32_t parseInteger(const char* text) {
    return parseClamped(text, baseOf(text));
}

std::int32_t parseDecimal(const char* text) {
    return parseClamped(text, 10);
}

void copyBounded(char* out, const char* text, int size) {
    if (size < 1) return;
    std::strncpy(out, text, static_cast<std::size_t>(size));
}

BoundedWriter& BoundedWriter::operator<<(std::string_view text) {
    if (written_ >= size_) return *this;
    const std::size_t count = std::min(text.size(), static_cast<std::size_t>(size_ - written_));
    std::copy_n(text.begin(), count, out_ + written_);
    written_ += static_cast<int>(count);
    return *this;
}

BoundedWriter& BoundedWriter::operator<<(int number) {
    std::array<char, 16> digits;
    char* const begin = digits.data();
    const char* const end = std::to_chars(begin, begin + digits.size(), number).ptr;
    return *this << std::string_view(begin, static_cast<std::size_t>(end - begin));
}

void BoundedWriter::pad() {
    for (; written_ < size_; ++written_)
        out_[written_] = '\0';
}

}  // namespace ProtUtilsN

char* itoa(int value, char* buffer, int base) {
    const auto divisor = static_cast<unsigned>(base);
    auto rest = static_cast<unsigned>(value);
    char* end = buffer;
    do {
        const unsigned digit = rest % divisor;
        const char zero = base == 16 && digit > 9 ? 'a' - 10 : '0';
        *end++ = static_cast<char>(static_cast<unsigned>(zero) + digit);
        rest /= divisor;
    } while (rest != 0);
    *end = '\0';
    std::reverse(buffer, end);
    return buffer;
}
