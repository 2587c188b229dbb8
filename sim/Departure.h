// A reply on its way out, character by character at the speed of the line. Pure: the clock is the
// caller's.
#pragma once

#include <cstddef>

#include "sim/Fault.h"
#include "sim/Pacing.h"
#include "wire/Bytes.h"

namespace sim {

/// Every character's instant is reckoned from the start, so that a late wake-up delays what is due
/// then and nothing behind it. Only the pauses of a dripping reply count from when the piece before
/// them really left: a pause is never shorter than it should be.
/// Threads: one at a time.
class Departure {
  public:
    /// @param start  The first character begins; at its end it can be read. The delay of the
    ///               transmission is the caller's.
    Departure(Transmission transmission, wire::LineRate rate, Instant start);

    /// @return when something is to be done: characters are due, or all is over.
    Instant next() const;

    /// @return the characters that have left by `now` and were not taken yet; valid until the next
    /// call. It can take several calls: one returns no more than a piece.
    wire::ByteView take(Instant now);

    /// Whether by `now` all is over, the pause behind the last piece included.
    bool finished(Instant now) const { return allTaken() && now >= end_; }

    /// @return when all is over. REQUIRES: finished() has returned true.
    Instant end() const { return end_; }

    const Transmission& transmission() const { return transmission_; }

  private:
    bool allTaken() const { return taken_ == transmission_.bytes.size(); }
    Instant leavesAt(std::size_t count) const;
    void beginPiece(Instant start);
    void endPiece(Instant now);

    Transmission transmission_;
    wire::LineRate rate_;
    std::size_t group_;
    std::size_t taken_ = 0;
    std::size_t pieceBegin_ = 0;
    std::size_t pieceSize_ = 0;
    Instant pieceStart_{};
    Instant end_{};
};

}  // namespace sim
