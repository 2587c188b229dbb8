// Locks and pauses on POSIX threads.
#include "runtime/PosixMultiTask.h"

#include <cerrno>
#include <ctime>
#include <mutex>

namespace runtime {
namespace {

class PosixLock final : public ILock {
  public:
    void lock() override { mutex_.lock(); }
    void unlock() override { mutex_.unlock(); }

  private:
    std::mutex mutex_;
};

constexpr long kNanosecondsPerSecond = 1'000'000'000;

/// The point of the monotonic clock that is `ms` milliseconds away.
timespec fromNow(int ms) {
    timespec until{};
    ::clock_gettime(CLOCK_MONOTONIC, &until);
    until.tv_sec += ms / 1000;
    until.tv_nsec += (ms % 1000) * 1'000'000L;
    if (until.tv_nsec >= kNanosecondsPerSecond) {
        ++until.tv_sec;
        until.tv_nsec -= kNanosecondsPerSecond;
    }
    return until;
}

}  // namespace

void* PosixMultiTask::ConvertTo(const char* name) {
    return CompareInterface(name, "IMultiTask2") ? static_cast<IMultiTask2*>(this) : nullptr;
}

ILock* PosixMultiTask::createLock(int /*reserved*/) {
    auto* made = new PosixLock;
    ++locks_;
    return made;
}

void PosixMultiTask::deleteLock(ILock* lock) {
    if (lock == nullptr) return;
    delete static_cast<PosixLock*>(lock);
    --locks_;
}

void PosixMultiTask::sleep(int ms) {
    if (ms <= 0) return;
    const timespec until = fromNow(ms);
    while (::clock_nanosleep(CLOCK_MONOTONIC, TIMER_ABSTIME, &until, nullptr) == EINTR) {
    }
}

}  // namespace runtime
