#include "poll/LinePoller.h"

#include <utility>

#include "poll/LineMachine.h"

namespace poll {

LinePoller::LinePoller(LineSetup setup, std::unique_ptr<BlockSource> source, Clock& clock,
                       FaultReport report)
    : setup_(std::make_shared<const LineSetup>(std::move(setup))),
      clock_(clock),
      machine_(std::make_unique<LineMachine>(setup_, std::move(source), clock, std::move(report))) {
}

LinePoller::~LinePoller() {
    stop();
}

void LinePoller::start() {
    thread_ = std::thread([this] { run(); });
}

void LinePoller::stop() {
    {
        const std::lock_guard lock(mutex_);
        stopping_ = true;
    }
    wake_.notify_one();
    if (thread_.joinable()) thread_.join();
    machine_->close();
}

Snapshot LinePoller::snapshot() const {
    return machine_->snapshot();
}

WriteResult LinePoller::write(std::size_t tag, std::vector<std::uint8_t> value) {
    WriteResult result = machine_->write(tag, std::move(value));
    {
        const std::lock_guard lock(mutex_);
        woken_ = true;
    }
    wake_.notify_one();
    return result;
}

void LinePoller::adopt(const KnownTags& known) {
    machine_->adopt(known);
}

void LinePoller::run() {
    while (waitUntil(next_))
        next_ = machine_->step();
}

/// @return whether to go on. A write ends the wait early.
bool LinePoller::waitUntil(Clock::TimePoint moment) {
    std::unique_lock lock(mutex_);
    const auto pause = moment - clock_.now();
    if (pause > pause.zero()) wake_.wait_for(lock, pause, [this] { return woken_ || stopping_; });
    woken_ = false;
    return !stopping_;
}

}  // namespace poll
