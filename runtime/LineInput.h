// What has arrived on a line, kept until it has been dealt with.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "runtime/Line.h"
#include "runtime/LineTransfer.h"
#include "runtime/ReplyRules.h"

namespace runtime {

/// Reads all that is there with one system call and keeps it together, so that a frame can be
/// looked at as a whole. Threads: one at a time.
class LineInput {
  public:
    /// Twice the longest frame of serial Modbus (ASCII, 513 characters).
    static constexpr std::size_t kRoom = 1026;

    /// @param line  Must outlive this object.
    explicit LineInput(Line& line) : line_(line) {}

    /// What has arrived and was not dropped, in the order of its coming.
    ByteView bytes() const { return {bytes_.data(), count_}; }
    bool isFull() const { return count_ == kRoom; }
    /// When bytes last came in; the clock's epoch before the first ones.
    Line::TimePoint lastArrival() const { return lastArrival_; }

    /// Takes in what is there without waiting. REQUIRES: not full.
    /// @return TimedOut when there was nothing.
    Transfer look();
    /// Waits until something more is there. REQUIRES: not full.
    Transfer await(Line::TimePoint until);

    /// Throws away the first bytes. REQUIRES: count <= bytes().size().
    void drop(std::size_t count);
    void clear() { count_ = 0; }

  private:
    Line& line_;
    std::array<std::uint8_t, kRoom> bytes_{};
    std::size_t count_ = 0;
    Line::TimePoint lastArrival_{};
};

}  // namespace runtime
