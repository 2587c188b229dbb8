#include "sim/TextNumbers.h"

#include <algorithm>
#include <cstdint>
#include <string>

namespace sim {
namespace {

constexpr std::size_t kDigitsBehindThePoint = 3;

bool areDigits(std::string_view text) {
    return !text.empty() && text.find_first_not_of("0123456789") == std::string_view::npos;
}

}  // namespace

bool readTime(std::string_view text, Nanos unit, Nanos& out) {
    const std::size_t point = text.find('.');
    std::string thousandths(point == std::string_view::npos ? "000" : text.substr(point + 1));
    if (!areDigits(thousandths) || thousandths.size() > kDigitsBehindThePoint) return false;
    thousandths.resize(kDigitsBehindThePoint, '0');
    const std::string_view whole = text.substr(0, point);
    if (!areDigits(whole)) return false;
    const std::int64_t most = kLongestTime / (unit / 1000);
    std::int64_t count = 0;
    if (!readNumber<std::int64_t>(std::string(whole) + thousandths, 0, most, count)) return false;
    out = count * (unit / 1000);
    return true;
}

}  // namespace sim
