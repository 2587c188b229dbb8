// Whether a node is worth asking. Pure: the moments are passed in.
#pragma once

#include <chrono>

#include "poll/LineSetup.h"

namespace poll {

/// A node that fails several times in a row is only probed, after pauses that double, until it
/// answers again.
class NodeHealth {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;
    using Duration = std::chrono::nanoseconds;

    /// REQUIRES: at least one failure, pauses above 0.
    explicit NodeHealth(const Patience& patience) : patience_(patience) {}

    /// @param now  The end of the request, here as below. @return whether the node has come back.
    bool succeeded(TimePoint now);
    /// @return whether the node has just become unreachable.
    bool failed(TimePoint now);
    /// Nothing is known any more: the port was away.
    void forget(TimePoint now) { succeeded(now); }

    [[nodiscard]] bool reachable() const { return reachable_; }
    /// When the next probe is due. REQUIRES: !reachable().
    [[nodiscard]] TimePoint probeAt() const { return probeAt_; }
    /// Altogether, the present time included.
    [[nodiscard]] Duration unreachableFor(TimePoint now) const;

  private:
    Patience patience_;
    int failures_ = 0;
    bool reachable_ = true;
    TimePoint lostAt_{};
    TimePoint probeAt_{};
    Duration pause_{0};
    Duration before_{0};  // Times that have ended.
};

}  // namespace poll
