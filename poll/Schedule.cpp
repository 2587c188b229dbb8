#include "poll/Schedule.h"

#include <algorithm>
#include <utility>

namespace poll {

Schedule::Schedule(std::vector<Duration> periods, TimePoint now) : periods_(std::move(periods)) {
    for (std::size_t block = 0; block < periods_.size(); ++block)
        heap_.push_back({now, block});
    order();
}

bool Schedule::later(const Entry& a, const Entry& b) {
    return a.due != b.due ? a.due > b.due : a.block > b.block;
}

void Schedule::order() {
    std::make_heap(heap_.begin(), heap_.end(), later);
}

std::optional<Schedule::TimePoint> Schedule::nextDue() const {
    if (heap_.empty()) return std::nullopt;
    return heap_.front().due;
}

std::optional<std::size_t> Schedule::take(TimePoint now) {
    if (heap_.empty() || heap_.front().due > now) return std::nullopt;
    std::pop_heap(heap_.begin(), heap_.end(), later);
    Entry& entry = heap_.back();
    const Duration period = periods_[entry.block];
    const auto missed = (now - entry.due) / period;
    entry.due += (missed + 1) * period;
    lastLate_ = static_cast<std::uint64_t>(missed);
    lateCycles_ += lastLate_;
    const std::size_t block = entry.block;
    std::push_heap(heap_.begin(), heap_.end(), later);
    return block;
}

void Schedule::restart(const std::vector<std::size_t>& blocks, TimePoint now) {
    std::vector<bool> wanted(periods_.size());
    for (const std::size_t block : blocks)
        wanted[block] = true;
    for (Entry& entry : heap_)
        if (wanted[entry.block]) entry.due = now;
    order();
}

void Schedule::restartAll(TimePoint now) {
    for (Entry& entry : heap_)
        entry.due = now;
    order();
}

}  // namespace poll
