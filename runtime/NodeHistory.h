// What one node has shown of its pace. Pure: the moments are passed in.
#pragma once

#include <chrono>
#include <cstdint>

#include "runtime/Line.h"

namespace runtime {

/// How long replies of a node have to be expected.
///
/// "Largest turnaround" is the longest time from a request, or from the reply before, to a reply
/// of which it is certain that it was that long; "suspected" one that may have been, because the
/// request had been repeated and nobody knows yet which of them was answered.
class NodeHistory {
  public:
    using TimePoint = Line::TimePoint;
    using Duration = std::chrono::nanoseconds;

    /// Silence that no timeout and no suspicion makes longer.
    static constexpr Duration kLongestPatience = std::chrono::seconds{5};
    /// Longest silence at all; also how long requests to a node that was never heard are
    /// remembered.
    static constexpr Duration kLongestMemory = std::chrono::seconds{15};

    void sent(TimePoint now) { lastSent_ = now; }
    /// How long others wait for its replies.
    void setTimeout(Duration timeout) { timeout_ = timeout; }
    /// The node was heard. `known`: the turnaround that is certain; `suspected`: that may have
    /// been.
    void heard(TimePoint now, Duration known, Duration suspected);
    /// All that was owed has come, so that what was suspected was so.
    void confirm();
    /// What was suspected was not so.
    void dismiss() { suspected_ = Duration{0}; }

    /// How long the node must be silent before nothing can come any more: twice the largest
    /// turnaround or the timeout, whichever is longer.
    Duration patience() const;
    /// Until when replies must be expected when nothing more is sent.
    TimePoint silentAt() const { return lastEvent() + patience(); }
    /// The moment of the last request to the node or reply from it.
    TimePoint lastEvent() const;

    bool wasHeard() const { return wasHeard_; }
    TimePoint lastHeard() const { return lastHeard_; }
    Duration largest() const { return largest_; }
    Duration timeout() const { return timeout_; }

  private:
    TimePoint lastSent_{};
    TimePoint lastHeard_{};
    Duration timeout_{0};
    Duration largest_{0};
    Duration suspected_{0};
    bool wasHeard_ = false;
};

}  // namespace runtime
