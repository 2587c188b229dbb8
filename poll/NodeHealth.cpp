#include "poll/NodeHealth.h"

#include <algorithm>

namespace poll {

bool NodeHealth::succeeded(TimePoint now) {
    failures_ = 0;
    if (reachable_) return false;
    before_ = unreachableFor(now);
    reachable_ = true;
    return true;
}

bool NodeHealth::failed(TimePoint now) {
    if (!reachable_) {
        pause_ = std::min<Duration>(pause_ * 2, patience_.longestPause);
        probeAt_ = now + pause_;
        return false;
    }
    if (++failures_ < patience_.failures) return false;
    reachable_ = false;
    lostAt_ = now;
    pause_ = patience_.firstProbe;
    probeAt_ = now + pause_;
    return true;
}

NodeHealth::Duration NodeHealth::unreachableFor(TimePoint now) const {
    return reachable_ ? before_ : before_ + (now - lostAt_);
}

}  // namespace poll
