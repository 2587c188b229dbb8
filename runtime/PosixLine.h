// A serial line behind a file descriptor: the one place that reads, writes and polls.
#pragma once

#include <atomic>

#include "runtime/Line.h"

namespace runtime {

/// A line that was once seen to be gone stays gone: every later call says so without a system
/// call. End of file, an I/O error, and hang-up, error or bad descriptor from poll() mean gone.
/// Threads: discardInput() and discardOutput() may come beside any other operation.
class PosixLine final : public Line {
  public:
    /// @param fd  A terminal opened with O_NONBLOCK whose empty reads say EAGAIN (VMIN 1). Stays
    /// the caller's and must outlive the line.
    explicit PosixLine(int fd) : fd_(fd) {}

    TimePoint now() override { return Clock::now(); }
    WaitResult waitReadable(TimePoint until) override;
    WaitResult waitWritable(TimePoint until) override;
    void sleepUntil(TimePoint until) override;
    Moved read(std::span<std::uint8_t> buffer) override;
    Moved write(std::span<const std::uint8_t> data) override;
    std::size_t unsent() override;
    void discardInput() override;
    void discardOutput() override;

    bool gone() const { return gone_; }

  private:
    WaitResult wait(short event, TimePoint until);
    bool isEmpty() const;
    Moved moved(long result);

    int fd_;
    bool readable_ = false;  // The last wait has seen something to read.
    std::atomic<bool> gone_ = false;
};

}  // namespace runtime
