#include "poll/Histogram.h"

#include <algorithm>
#include <bit>
#include <cmath>

namespace poll {

// Below 8 a step is one microsecond wide; above, the three bits behind the leading one count.
std::size_t Histogram::stepOf(std::uint64_t micros) {
    if (micros < (1U << kStepBits)) return static_cast<std::size_t>(micros);
    const int power = static_cast<int>(std::bit_width(micros)) - 1 - kStepBits;
    const auto step =
        (static_cast<std::size_t>(power) << kStepBits) + static_cast<std::size_t>(micros >> power);
    return std::min(step, kSteps - 1);
}

std::uint64_t Histogram::endOf(std::size_t step) {
    if (step < (1U << kStepBits)) return step + 1;
    const std::size_t power = (step >> kStepBits) - 1;
    const std::uint64_t leading = step - (power << kStepBits);
    return (leading + 1) << power;
}

void Histogram::add(Duration taken) {
    const auto micros = std::chrono::duration_cast<std::chrono::microseconds>(taken).count();
    ++steps_[stepOf(static_cast<std::uint64_t>(std::max<std::int64_t>(micros, 0)))];
    ++count_;
    max_ = std::max(max_, taken);
}

Histogram::Duration Histogram::quantile(double share) const {
    const auto wanted = static_cast<std::uint64_t>(std::ceil(share * static_cast<double>(count_)));
    std::uint64_t seen = 0;
    for (std::size_t step = 0; step < kSteps; ++step) {
        seen += steps_[step];
        if (seen >= std::max<std::uint64_t>(wanted, 1))
            return std::min<Duration>(std::chrono::microseconds{endOf(step)}, max_);
    }
    return max_;
}

}  // namespace poll
