// How long things took, in a fixed size. Pure.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>

namespace poll {

/// Durations in steps of an eighth: what it answers is at most 12.5 % too long, never too short.
class Histogram {
  public:
    using Duration = std::chrono::nanoseconds;

    void add(Duration taken);
    [[nodiscard]] std::uint64_t count() const { return count_; }
    /// @param share  0..1; 0.5 is the median. @return a duration that at least this share of all
    /// did not exceed, never more than max(); 0 when there are none.
    [[nodiscard]] Duration quantile(double share) const;
    [[nodiscard]] Duration max() const { return max_; }

  private:
    static constexpr int kStepBits = 3;  // Eight steps in every power of two.
    static constexpr int kPowers = 32;   // Microseconds: up to 71 minutes.
    static constexpr std::size_t kSteps = std::size_t{kPowers} << kStepBits;

    static std::size_t stepOf(std::uint64_t micros);
    static std::uint64_t endOf(std::size_t step);

    std::array<std::uint64_t, kSteps> steps_{};
    std::uint64_t count_ = 0;
    Duration max_{0};
};

}  // namespace poll
