// The simulator's ear: bytes that a master wrote at once arrive one after the other, at the speed
// of the line. Pure: the clock is the caller's.
#pragma once

#include <deque>
#include <optional>

#include "sim/Pacing.h"
#include "wire/Bytes.h"
#include "wire/Framing.h"

namespace sim {

/// A frame and the instant at which its last character had arrived.
struct Arrival {
    wire::Received frame;
    Instant at;
};

/// Threads: one at a time.
class Receiver {
  public:
    /// @param silence  Ends an RTU frame of no announced length.
    Receiver(wire::Mode mode, wire::RequestLength requestLength, wire::LineRate rate,
             Nanos silence);

    /// Bytes that were written up to `now`. They arrive from now on, or behind those that are still
    /// arriving.
    void add(wire::ByteView bytes, Instant now);

    /// @return the instant at which take() has something; kNever when nothing is on its way.
    Instant next() const;

    /// @return the oldest frame that has arrived by `now`; nothing when none has.
    std::optional<Arrival> take(Instant now);

    /// From when on the line has room for more. A sender's own port holds back what a slow line
    /// can't carry yet; here it is whoever reads, by leaving the bytes where they are.
    Instant hasRoomFrom() const;

  private:
    Instant silenceEnd() const;

    wire::FrameSplitter splitter_;
    wire::LineRate rate_;
    Nanos silence_;
    Instant start_{};             // Of the characters that follow one another without a pause, ...
    std::size_t characters_ = 0;  // ... and how many they are.
    Instant lastArrival_{};
    std::deque<Arrival> arrivals_;
};

}  // namespace sim
