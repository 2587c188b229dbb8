// Which block is read next. Pure: the moments are passed in.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <vector>

namespace poll {

/// Blocks with periods, in the order in which they are due; equally due ones in their own order.
///
/// A block keeps its phase. When a read begins a period or more after it was due, the periods that
/// went by are counted and left out: an overloaded line reads every block less often, and the one
/// that has waited longest first, so that none is ever left behind.
class Schedule {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;
    using Duration = std::chrono::nanoseconds;

    /// All are due at once. REQUIRES: periods above 0.
    Schedule(std::vector<Duration> periods, TimePoint now);

    /// @return when the next block is due; nothing when there are no blocks.
    [[nodiscard]] std::optional<TimePoint> nextDue() const;
    /// @return the block that has been due longest, and plans its next read; nothing when none is
    /// due.
    std::optional<std::size_t> take(TimePoint now);
    /// Gives back the lateness that the last take() counted: the block was not to be read at all.
    void forgive() {
        lateCycles_ -= lastLate_;
        lastLate_ = 0;
    }
    /// Makes blocks due at once, without counting what was missed meanwhile.
    void restart(const std::vector<std::size_t>& blocks, TimePoint now);
    void restartAll(TimePoint now);

    /// Periods that went by without a read.
    [[nodiscard]] std::uint64_t lateCycles() const { return lateCycles_; }

  private:
    struct Entry {
        TimePoint due;
        std::size_t block = 0;
    };

    static bool later(const Entry& a, const Entry& b);
    void order();

    std::vector<Duration> periods_;
    std::vector<Entry> heap_;  // The next one on top.
    std::uint64_t lateCycles_ = 0;
    std::uint64_t lastLate_ = 0;
};

}  // namespace poll
