// The multitasking service on POSIX threads.
#pragma once

#include <atomic>

#include "platform/IMultiTask2.h"

namespace runtime {

/// Threads: any, as the interface demands.
class PosixMultiTask final : public IMultiTask2 {
  public:
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "runtime::PosixMultiTask"; }
    int GetImpVersion() const override { return 100; }

    ILock* createLock(int reserved) override;
    /// Null is ignored.
    void deleteLock(ILock* lock) override;
    /// Sleeps until an absolute point of the monotonic clock, so signals do not cut it short.
    /// Nothing happens for 0 and below.
    void sleep(int ms) override;

    /// Locks created and not yet deleted.
    int locks() const { return locks_; }

  private:
    std::atomic<int> locks_{0};
};

}  // namespace runtime
