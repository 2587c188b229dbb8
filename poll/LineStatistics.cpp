#include "poll/LineStatistics.h"

#include <algorithm>

namespace poll {

void NodeStatistics::add(const Failure& failure, int requests, int repeats,
                         std::chrono::nanoseconds taken) {
    if (failure.kind == FailureKind::NotSent) return;
    counts_.requests += static_cast<std::uint64_t>(requests);
    if (failure.replied()) {
        counts_.replies += static_cast<std::uint64_t>(requests);
        taken_.add(taken / requests);
        if (failure.kind != FailureKind::None && failure.kind != FailureKind::Value)
            ++counts_.exceptions[failure.exception];
        return;
    }
    ++(failure.kind == FailureKind::Timeout ? counts_.timeouts : counts_.checkErrors);
    counts_.retries += static_cast<std::uint64_t>(repeats);
}

void NodeStatistics::fill(NodeState& state) const {
    state.requests = counts_.requests;
    state.replies = counts_.replies;
    state.timeouts = counts_.timeouts;
    state.checkErrors = counts_.checkErrors;
    state.exceptions = counts_.exceptions;
    state.retries = counts_.retries;
    state.p50 = taken_.quantile(0.5);
    state.p99 = taken_.quantile(0.99);
    state.max = taken_.max();
}

// A window that has just ended is kept; after a longer pause both have nothing to say.
void LineLoad::turn(TimePoint now) {
    const Duration age = now - start_;
    if (age < kWindow) return;
    const bool longAgo = age >= 2 * kWindow;
    busyBefore_ = longAgo ? Duration{0} : busy_;
    before_ = longAgo ? kWindow : age;
    busy_ = Duration{0};
    start_ = now;
}

void LineLoad::busy(TimePoint from, TimePoint to) {
    turn(from);
    busy_ += to - from;
}

double LineLoad::at(TimePoint now) const {
    LineLoad seen = *this;
    seen.turn(now);
    const std::chrono::duration<double> all = seen.before_ + (now - seen.start_);
    const std::chrono::duration<double> used = seen.busyBefore_ + seen.busy_;
    return all.count() > 0 ? std::min(used / all, 1.0) : 0.0;
}

void CycleMeter::done(std::size_t block, Duration taken) {
    cycle_ += taken - taken_[block];
    taken_[block] = taken;
    if (isDone_[block]) return;
    isDone_[block] = true;
    if (--left_ > 0) return;
    ++cycles_;
    left_ = isDone_.size();
    std::fill(isDone_.begin(), isDone_.end(), false);
}

}  // namespace poll
