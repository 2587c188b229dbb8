// One line, polled by a thread of its own.
#pragma once

#include <condition_variable>
#include <cstdint>
#include <future>
#include <memory>
#include <mutex>
#include <optional>
#include <thread>
#include <vector>

#include "poll/Clock.h"
#include "poll/LineSetup.h"
#include "poll/Snapshot.h"
#include "poll/ValueStore.h"
#include "poll/WriteQueue.h"

namespace poll {

class LineMachine;

/// Polls from start() to stop(). Nothing that happens on the line ends it: a port that vanishes is
/// closed and opened again.
/// Threads: any may call everything but start() and stop(), which belong to the owner.
class LinePoller {
  public:
    /// @param clock  Outlives the poller.
    LinePoller(LineSetup setup, std::unique_ptr<BlockSource> source, Clock& clock,
               FaultReport report);
    LinePoller(const LinePoller&) = delete;
    LinePoller& operator=(const LinePoller&) = delete;
    ~LinePoller();

    void start();
    /// Returns when the read or write in progress has ended and the port is closed. Writes that
    /// still wait fail. No later start().
    void stop();

    Snapshot snapshot() const;
    /// Ahead of all reads that wait. The result is nothing, or the driver's error; code -1 when
    /// the port is not open, -3 when the line has been stopped.
    WriteResult write(std::size_t tag, std::vector<std::uint8_t> value);

    const std::shared_ptr<const LineSetup>& setup() const { return setup_; }
    /// Takes over what is known of tags, by index. REQUIRES: before start().
    void adopt(const KnownTags& known);

  private:
    void run();
    bool waitUntil(Clock::TimePoint moment);

    std::shared_ptr<const LineSetup> setup_;
    Clock& clock_;
    const std::unique_ptr<LineMachine> machine_;
    std::mutex mutex_;  // Guards the two below.
    std::condition_variable wake_;
    bool woken_ = false;
    bool stopping_ = false;
    Clock::TimePoint next_{};  // Of the thread.
    std::thread thread_;
};

}  // namespace poll
