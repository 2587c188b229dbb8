// The few things that a serial line can do, as the transfers see them.
//
// The one implementation with system calls is PosixLine; tests bring one with a clock that moves
// when told.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <span>

namespace runtime {

enum class WaitResult {
    Ready,     ///< There is something to read, or room to write.
    TimedOut,  ///< The moment has come and there is still nothing.
    Gone,      ///< The line is no more.
};

/// What one read or write moved. `gone` tells that the line is no more; `count` is 0 then. A count
/// of 0 without it means "nothing at this moment".
struct Moved {
    std::size_t count = 0;
    bool gone = false;
};

/// A serial line. None of the operations but the waits ever blocks, and none is cut short by a
/// signal. One thread at a time.
class Line {
  public:
    using Clock = std::chrono::steady_clock;
    using TimePoint = Clock::time_point;

    virtual ~Line() = default;

    virtual TimePoint now() = 0;
    /// Waits until there is something to read; looks at least once, also when `until` is past.
    virtual WaitResult waitReadable(TimePoint until) = 0;
    /// The same for room to write.
    virtual WaitResult waitWritable(TimePoint until) = 0;
    virtual void sleepUntil(TimePoint until) = 0;
    /// Reads what is there, at most the buffer's size. REQUIRES: the buffer is not empty.
    virtual Moved read(std::span<std::uint8_t> buffer) = 0;
    /// Writes what there is room for.
    virtual Moved write(std::span<const std::uint8_t> data) = 0;
    /// @return bytes written and not yet on the wire; 0 where the line can't tell.
    virtual std::size_t unsent() = 0;
    /// Throws away what was received and not read.
    virtual void discardInput() = 0;
    /// Throws away what was written and is not yet on the wire.
    virtual void discardOutput() = 0;
};

}  // namespace runtime
