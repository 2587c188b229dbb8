// The host's multitasking service, "IMultiTask2".
#pragma once

#include "platform/IInterface.h"

/// A mutual exclusion lock, made by IMultiTask2::createLock().
class ILock {
  public:
    /// Waits until the lock is free and takes it. Not recursive.
    virtual void lock() = 0;
    /// Frees the lock. REQUIRES: the calling thread holds it.
    virtual void unlock() = 0;

  protected:
    ~ILock() = default;
};

/// Threads: every operation may be called from any thread.
class IMultiTask2 : public IInterface {
  public:
    /// @param reserved  0.
    /// @return a free lock, owned by the caller until deleteLock().
    virtual ILock* createLock(int reserved) = 0;
    /// Destroys a lock. REQUIRES: nobody holds it.
    virtual void deleteLock(ILock* lock) = 0;
    /// Suspends the calling thread for `ms` milliseconds.
    virtual void sleep(int ms) = 0;
};
