#include "tests/support/FakeMultiTask.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace testing_support {

class FakeMultiTask::FakeLock final : public ILock {
  public:
    explicit FakeLock(std::atomic<int>& timesLocked) : timesLocked_(timesLocked) {}
    virtual ~FakeLock() = default;

    void lock() override {
        if (heldByThisThread()) {
            ADD_FAILURE() << "a thread took a lock that it holds already";
            return;
        }
        mutex_.lock();
        owner_ = std::this_thread::get_id();
        ++timesLocked_;
    }

    void unlock() override {
        if (!heldByThisThread()) {
            ADD_FAILURE() << "a lock was freed by a thread that does not hold it";
            return;
        }
        owner_ = std::thread::id{};
        mutex_.unlock();
    }

    bool held() const { return owner_.load() != std::thread::id{}; }
    bool heldByThisThread() const { return owner_.load() == std::this_thread::get_id(); }

  private:
    std::mutex mutex_;
    std::atomic<std::thread::id> owner_;
    std::atomic<int>& timesLocked_;
};

FakeMultiTask::FakeMultiTask() = default;

FakeMultiTask::~FakeMultiTask() {
    if (!locks_.empty()) ADD_FAILURE() << locks_.size() << " lock(s) were never deleted";
}

void* FakeMultiTask::ConvertTo(const char* name) {
    return CompareInterface(name, "IMultiTask2") ? static_cast<IMultiTask2*>(this) : nullptr;
}

ILock* FakeMultiTask::createLock(int reserved) {
    EXPECT_EQ(0, reserved) << "createLock()";
    const std::lock_guard guard(mutex_);
    locks_.push_back(std::make_unique<FakeLock>(timesLocked_));
    return locks_.back().get();
}

void FakeMultiTask::deleteLock(ILock* lock) {
    const std::lock_guard guard(mutex_);
    const auto found = std::find_if(locks_.begin(), locks_.end(),
                                    [lock](const auto& known) { return known.get() == lock; });
    if (found == locks_.end()) {
        ADD_FAILURE() << "a lock was deleted that does not exist";
        return;
    }
    if ((*found)->held()) {
        ADD_FAILURE() << "a lock was deleted while it was held";
        found->release();  // NOLINT: destroying a held mutex would be undefined
    }
    locks_.erase(found);
}

void FakeMultiTask::sleep(int ms) {
    const bool lockHeld = heldByThisThread();
    EXPECT_GT(ms, 0) << "sleep()";
    {
        const std::lock_guard guard(mutex_);
        sleeps_.push_back({ms, lockHeld});
        nowMs_ += ms;
    }
    if (sleepWatcher_) sleepWatcher_();
}

std::vector<FakeMultiTask::Sleep> FakeMultiTask::sleeps() const {
    const std::lock_guard guard(mutex_);
    return sleeps_;
}

int FakeMultiTask::locksAlive() const {
    const std::lock_guard guard(mutex_);
    return static_cast<int>(locks_.size());
}

bool FakeMultiTask::anyLockHeld() const {
    const std::lock_guard guard(mutex_);
    return std::any_of(locks_.begin(), locks_.end(), [](const auto& lock) { return lock->held(); });
}

bool FakeMultiTask::heldByThisThread() const {
    const std::lock_guard guard(mutex_);
    return std::any_of(locks_.begin(), locks_.end(),
                       [](const auto& lock) { return lock->heldByThisThread(); });
}

}  // namespace testing_support
