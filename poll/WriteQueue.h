// Writes that wait for their line.
#pragma once

#include <cstdint>
#include <deque>
#include <future>
#include <mutex>
#include <optional>
#include <utility>
#include <vector>

#include "poll/BlockReader.h"

namespace poll {

/// Nothing when the device took the value, else why not.
using WriteOutcome = std::optional<ReadError>;
using WriteResult = std::future<WriteOutcome>;

struct PendingWrite {
    std::size_t tag = 0;
    std::vector<std::uint8_t> value;  ///< In run-time form.
    std::promise<WriteOutcome> done;
};

/// First come, first served. Threads: any.
class WriteQueue {
  public:
    /// After close() the result is there at once: code -3.
    WriteResult add(std::size_t tag, std::vector<std::uint8_t> value);
    std::optional<PendingWrite> take();
    /// Ends all that wait with an error.
    void refuseAll(const ReadError& error);
    /// As refuseAll() with code -3, now and for ever.
    void close();

  private:
    std::deque<PendingWrite> takeAll();

    std::mutex mutex_;
    std::deque<PendingWrite> waiting_;
    bool closed_ = false;
};

}  // namespace poll
