#include "runtime/NodeHistory.h"

#include <algorithm>

namespace runtime {

void NodeHistory::heard(TimePoint now, Duration known, Duration suspected) {
    largest_ = std::max(largest_, known);
    suspected_ = std::max(suspected_, suspected);
    lastHeard_ = now;
    wasHeard_ = true;
}

void NodeHistory::confirm() {
    largest_ = std::max(largest_, suspected_);
    suspected_ = Duration{0};
}

NodeHistory::Duration NodeHistory::patience() const {
    const Duration supposed = std::min(2 * std::max(timeout_, suspected_), kLongestPatience);
    return std::max(supposed, std::min(2 * largest_, kLongestMemory));
}

NodeHistory::TimePoint NodeHistory::lastEvent() const {
    return std::max(lastSent_, lastHeard_);
}

}  // namespace runtime
