// A multitasking service whose clock moves only when told.
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

#include "platform/IMultiTask2.h"

namespace testing_support {

/// Sleeping takes no time: it moves the clock and is recorded. The locks are real ones and police
/// their users: the test fails when a thread takes a lock twice, frees one that it does not hold,
/// deletes one that is held, or leaves one behind.
class FakeMultiTask final : public IMultiTask2 {
  public:
    struct Sleep {
        int ms;
        bool lockHeld;  ///< The sleeping thread held a lock.
    };

    FakeMultiTask();
    ~FakeMultiTask() override;

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "FakeMultiTask"; }
    int GetImpVersion() const override { return 7; }
    ILock* createLock(int reserved) override;
    void deleteLock(ILock* lock) override;
    void sleep(int ms) override;

    /// Called at the end of every sleep().
    void onSleep(std::function<void()> watcher) { sleepWatcher_ = std::move(watcher); }

    std::int64_t nowMs() const { return nowMs_; }
    void advance(std::int64_t ms) { nowMs_ += ms; }

    std::vector<Sleep> sleeps() const;
    int locksAlive() const;
    /// How often any lock was taken.
    int timesLocked() const { return timesLocked_; }
    bool anyLockHeld() const;
    bool heldByThisThread() const;

  private:
    class FakeLock;

    mutable std::mutex mutex_;
    std::vector<std::unique_ptr<FakeLock>> locks_;
    std::vector<Sleep> sleeps_;
    std::function<void()> sleepWatcher_;
    std::atomic<std::int64_t> nowMs_ = 0;
    std::atomic<int> timesLocked_ = 0;
};

}  // namespace testing_support
