#include "poll/WriteQueue.h"

namespace poll {

namespace {

const ReadError kStopped{-3, "The line is not polled any more"};

}  // namespace

WriteResult WriteQueue::add(std::size_t tag, std::vector<std::uint8_t> value) {
    PendingWrite write{tag, std::move(value), {}};
    WriteResult result = write.done.get_future();
    const std::lock_guard lock(mutex_);
    if (closed_)
        write.done.set_value(kStopped);
    else
        waiting_.push_back(std::move(write));
    return result;
}

std::optional<PendingWrite> WriteQueue::take() {
    const std::lock_guard lock(mutex_);
    if (waiting_.empty()) return std::nullopt;
    PendingWrite first = std::move(waiting_.front());
    waiting_.pop_front();
    return first;
}

std::deque<PendingWrite> WriteQueue::takeAll() {
    const std::lock_guard lock(mutex_);
    return std::exchange(waiting_, {});
}

void WriteQueue::refuseAll(const ReadError& error) {
    for (PendingWrite& write : takeAll())
        write.done.set_value(error);
}

void WriteQueue::close() {
    {
        const std::lock_guard lock(mutex_);
        closed_ = true;
    }
    refuseAll(kStopped);
}

}  // namespace poll
