// A host's lock in the hands of its owner.
#pragma once

#include "platform/IMultiTask2.h"

/// Makes a lock and deletes it, also when the owner's constructor fails half way.
class OwnedLock {
  public:
    /// @param tasks  May be null: there is no lock then.
    explicit OwnedLock(IMultiTask2* tasks)
        : tasks_(tasks), lock_(tasks != nullptr ? tasks->createLock(0) : nullptr) {}
    ~OwnedLock() { reset(); }
    OwnedLock(const OwnedLock&) = delete;
    OwnedLock& operator=(const OwnedLock&) = delete;

    explicit operator bool() const { return lock_ != nullptr; }
    /// REQUIRES: there is a lock.
    ILock& operator*() const { return *lock_; }

    void reset() {
        if (lock_ != nullptr) tasks_->deleteLock(lock_);
        lock_ = nullptr;
    }

  private:
    IMultiTask2* tasks_;
    ILock* lock_;
};
