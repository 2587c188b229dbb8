// The beginning of a reply that a pause has cut off. Pure: the moments are passed in.
#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>

#include "runtime/Line.h"
#include "runtime/ReplyRules.h"

namespace runtime {

/// Keeps a short frame until its rest comes, or until it is clear that it does not.
class CutReply {
  public:
    /// Holds the longest frame of serial Modbus in ASCII with room to spare.
    static constexpr std::size_t kRoom = 520;

    /// @param whole  The length of the whole frame; a frame that is not shorter is not kept.
    void keep(ByteView start, std::size_t whole, Line::TimePoint now);
    void forget() { length_ = 0; }
    bool isEmpty() const { return length_ == 0; }
    std::size_t lacking() const { return lacking_; }

    /// @return start and rest as one frame, valid until the next call; empty when they are longer
    /// than any frame.
    ByteView joined(ByteView rest);
    /// How long the line paused between the two.
    std::chrono::nanoseconds pauseUntil(Line::TimePoint now) const { return now - at_; }

  private:
    std::array<std::uint8_t, kRoom> bytes_{};
    std::size_t length_ = 0;
    std::size_t lacking_ = 0;
    Line::TimePoint at_{};
};

}  // namespace runtime
