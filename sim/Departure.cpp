#include "sim/Departure.h"

#include <algorithm>
#include <utility>

namespace sim {

Departure::Departure(Transmission transmission, wire::LineRate rate, Instant start)
    : transmission_(std::move(transmission)), rate_(rate), group_(groupOf(rate)), end_(start) {
    beginPiece(start);
}

void Departure::beginPiece(Instant start) {
    const std::size_t rest = transmission_.bytes.size() - taken_;
    const bool inPieces = transmission_.dripBytes != 0;
    pieceBegin_ = taken_;
    pieceSize_ = inPieces ? std::min(rest, transmission_.dripBytes) : rest;
    pieceStart_ = start;
}

Instant Departure::leavesAt(std::size_t count) const {
    return pieceStart_ + wire::timeOfCharacters(count, rate_);
}

Instant Departure::next() const {
    if (allTaken()) return end_;
    const std::size_t rest = pieceBegin_ + pieceSize_ - taken_;
    return leavesAt(taken_ - pieceBegin_ + std::min(rest, group_));
}

wire::ByteView Departure::take(Instant now) {
    const std::size_t begin = taken_;
    const std::size_t pieceEnd = pieceBegin_ + pieceSize_;
    while (taken_ < pieceEnd && next() <= now)
        taken_ += std::min(pieceEnd - taken_, group_);
    if (taken_ != begin && taken_ == pieceEnd) endPiece(now);
    return wire::ByteView(transmission_.bytes).subspan(begin, taken_ - begin);
}

void Departure::endPiece(Instant now) {
    end_ = leavesAt(pieceSize_);
    if (transmission_.dripBytes == 0) return;
    const Instant pauseEnd = now + std::chrono::milliseconds(transmission_.dripGapMs);
    // Before a hang-up the last piece, too, gets its pause: the master can take it.
    if (allTaken() && transmission_.hangUp) end_ = pauseEnd;
    if (!allTaken()) beginPiece(pauseEnd);
}

}  // namespace sim
