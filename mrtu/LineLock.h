// Holds the lock of a serial line for as long as it lives.
#pragma once

#include "mrtu/Protocol_MRTU.h"

class Protocol_MRTU::LineLock {
  public:
    explicit LineLock(const Protocol_MRTU& protocol) : lock_(*protocol.lock_) { lock_.lock(); }
    ~LineLock() { lock_.unlock(); }
    LineLock(const LineLock&) = delete;
    LineLock& operator=(const LineLock&) = delete;

  private:
    ILock& lock_;
};
