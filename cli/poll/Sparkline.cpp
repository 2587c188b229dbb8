// Scales values to eight heights.
#include "cli/poll/Sparkline.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <span>

namespace cli {
namespace {

constexpr std::array kBars{"▁", "▂", "▃", "▄", "▅", "▆", "▇", "█"};
constexpr std::array kPlainBars{"_", ".", ",", "-", "~", "=", "*", "#"};
static_assert(kBars.size() == kPlainBars.size());

struct Scale {
    double smallest = std::numeric_limits<double>::infinity();
    double largest = -std::numeric_limits<double>::infinity();
};

Scale scaleOf(std::span<const double> values) {
    Scale scale;
    for (const double value : values) {
        if (!std::isfinite(value)) continue;
        scale.smallest = std::min(scale.smallest, value);
        scale.largest = std::max(scale.largest, value);
    }
    return scale;
}

std::size_t heightOf(double value, const Scale& scale) {
    if (scale.smallest == scale.largest) return 0;
    // Halved first: the difference of two large numbers may be infinite.
    const double part = (value / 2 - scale.smallest / 2) / (scale.largest / 2 - scale.smallest / 2);
    const double last = static_cast<double>(kBars.size() - 1);
    return static_cast<std::size_t>(std::lround(std::clamp(part, 0.0, 1.0) * last));
}

}  // namespace

std::string sparkline(const std::vector<double>& values, std::size_t width, bool unicode) {
    const std::size_t count = std::min(width, values.size());
    const std::span<const double> shown = std::span(values).last(count);
    const Scale scale = scaleOf(shown);
    std::string bars;
    for (const double value : shown) {
        const auto& set = unicode ? kBars : kPlainBars;
        bars += std::isfinite(value) ? set[heightOf(value, scale)] : " ";
    }
    return bars;
}

}  // namespace cli
