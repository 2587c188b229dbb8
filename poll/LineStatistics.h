// What a line and its nodes have done. Pure: the moments are passed in.
#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "poll/Failure.h"
#include "poll/Histogram.h"
#include "poll/Snapshot.h"

namespace poll {

/// Counts the requests to one node.
class NodeStatistics {
  public:
    /// @param requests  That an answered read took, 1.. @param repeats  The driver's, of a request
    /// that fails. @param taken  From the call to its end.
    void add(const Failure& failure, int requests, int repeats, std::chrono::nanoseconds taken);
    /// Fills what is counted; number, reachability and unreachable time stay as they are.
    void fill(NodeState& state) const;
    [[nodiscard]] std::chrono::nanoseconds longestAnswer() const { return taken_.max(); }

  private:
    NodeState counts_;
    Histogram taken_;
};

/// How much of the line's time is in use.
class LineLoad {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;
    using Duration = std::chrono::nanoseconds;

    /// What is older than twice this counts no more.
    static constexpr Duration kWindow = std::chrono::seconds{10};

    explicit LineLoad(TimePoint start) : start_(start) {}
    void busy(TimePoint from, TimePoint to);
    /// @return 0..1.
    [[nodiscard]] double at(TimePoint now) const;

  private:
    void turn(TimePoint now);

    TimePoint start_;  // Of the present window.
    Duration busy_{0};
    Duration busyBefore_{0};  // In the window before.
    Duration before_{0};      // Its length; 0 when there was none.
};

/// How long one read of every block takes, and how often all of them were read.
class CycleMeter {
  public:
    using Duration = std::chrono::nanoseconds;

    explicit CycleMeter(std::size_t blocks) : taken_(blocks), isDone_(blocks), left_(blocks) {}
    /// A block was read, in whatever number of parts.
    void done(std::size_t block, Duration taken);
    /// A block is left out: its node is not reachable.
    void skip(std::size_t block) { done(block, Duration{0}); }

    [[nodiscard]] Duration cycle() const { return cycle_; }
    [[nodiscard]] std::uint64_t cycles() const { return cycles_; }

  private:
    std::vector<Duration> taken_;
    std::vector<bool> isDone_;  // In this cycle.
    std::size_t left_;
    Duration cycle_{0};
    std::uint64_t cycles_ = 0;
};

}  // namespace poll
