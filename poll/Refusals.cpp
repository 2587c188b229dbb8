#include "poll/Refusals.h"

#include <algorithm>
#include <iterator>

namespace poll {

void Refusals::begin(TimePoint now) {
    busy_ = true;
    at_ = 0;
    trials_ = 0;
    tryWhole_ = !isSplit() || now >= retryAt_;
}

const Block* Refusals::next() {
    if (!busy_) return nullptr;
    if (tryWhole_) {
        attempt_ = Attempt::Whole;
        return block_;
    }
    skipHoles();
    if (at_ >= pieces_.size()) {
        busy_ = false;
        return nullptr;
    }
    if (joinable()) return show(Attempt::Joined, pieces_[at_].from, pieces_[at_ + 1].to);
    return show(Attempt::Piece, pieces_[at_].from, pieces_[at_].to);
}

const Block* Refusals::show(Attempt attempt, std::size_t from, std::size_t to) {
    attempt_ = attempt;
    shown_ = *block_;
    shown_.tags.assign(std::next(block_->tags.begin(), static_cast<std::ptrdiff_t>(from)),
                       std::next(block_->tags.begin(), static_cast<std::ptrdiff_t>(to)));
    shown_.first = places_[shown_.tags.front()].first;
    long end = shown_.first;
    for (const std::size_t tag : shown_.tags)
        end = std::max(end, places_[tag].first + places_[tag].items);
    shown_.items = end - shown_.first;
    shown_.reason = "part of a block that was refused";
    return &shown_;
}

// While holes are looked for nothing is joined: it would bring them back in.
bool Refusals::joinable() const {
    const auto isSuspect = [](const Piece& piece) { return piece.state == Piece::State::Suspect; };
    if (at_ + 1 >= pieces_.size() || pieces_[at_].apart) return false;
    if (pieces_[at_].state != Piece::State::Good) return false;
    if (pieces_[at_ + 1].state != Piece::State::Good) return false;
    return std::none_of(pieces_.begin(), pieces_.end(), isSuspect);
}

bool Refusals::isDue(const Piece& piece) {
    if (piece.state != Piece::State::Hole) return true;
    if (trials_ == 0 || piece.from < nextTrial_) return false;
    --trials_;
    nextTrial_ = piece.to;
    return true;
}

void Refusals::skipHoles() {
    while (at_ < pieces_.size() && !isDue(pieces_[at_]))
        ++at_;
}

void Refusals::accepted() {
    if (attempt_ == Attempt::Whole) {
        pieces_.clear();
        refusals_ = 0;
        busy_ = false;
        return;
    }
    Piece& piece = pieces_[at_];
    if (attempt_ == Attempt::Joined) {
        piece.to = pieces_[at_ + 1].to;
        piece.apart = pieces_[at_ + 1].apart;
        pieces_.erase(std::next(pieces_.begin(), static_cast<std::ptrdiff_t>(at_) + 1));
    }
    piece.state = Piece::State::Good;
    piece.refusals = 0;
    ++at_;
}

Refusals::Verdict Refusals::refused(TimePoint now) {
    if (attempt_ == Attempt::Whole) return refusedWhole(now);
    if (attempt_ == Attempt::Piece) return refusedPiece();
    pieces_[at_].apart = true;
    return Verdict::Parts;
}

Refusals::Verdict Refusals::refusedWhole(TimePoint now) {
    if (isSplit()) {  // A trial: go on with the parts.
        tryWhole_ = false;
        planTrials();
        retryAt_ = now + retry_;
        return Verdict::Parts;
    }
    if (++refusals_ < kPatience) {
        busy_ = false;
        return Verdict::Once;
    }
    tryWhole_ = false;
    retryAt_ = now + retry_;
    pieces_.push_back({.from = 0, .to = block_->tags.size()});
    return refusedPiece();
}

// The whole of a single tag was its trial already.
void Refusals::planTrials() {
    trials_ = block_->tags.size() > 1 ? kTrials : 0;
    const auto isLeft = [this](const Piece& piece) {
        return piece.state == Piece::State::Hole && piece.from >= nextTrial_;
    };
    if (std::none_of(pieces_.begin(), pieces_.end(), isLeft)) nextTrial_ = 0;
}

Refusals::Verdict Refusals::refusedPiece() {
    Piece& piece = pieces_[at_];
    const bool justOnce = piece.state == Piece::State::Good && ++piece.refusals < kPatience;
    if (!justOnce && piece.to - piece.from > 1) {
        halve(piece);
        return Verdict::Parts;
    }
    ++at_;
    if (justOnce) return Verdict::Once;
    piece.state = Piece::State::Hole;
    return Verdict::Hole;
}

void Refusals::halve(const Piece& piece) {
    const Piece whole = piece;
    const std::size_t middle = whole.from + (whole.to - whole.from) / 2;
    pieces_[at_] = {.from = whole.from, .to = middle};
    pieces_.insert(std::next(pieces_.begin(), static_cast<std::ptrdiff_t>(at_) + 1),
                   {.from = middle, .to = whole.to, .apart = whole.apart});
}

void Refusals::failed() {
    if (attempt_ == Attempt::Whole) busy_ = false;
    at_ += attempt_ == Attempt::Joined ? 2 : 1;
}

std::size_t Refusals::holes() const {
    const auto isHole = [](const Piece& piece) { return piece.state == Piece::State::Hole; };
    return static_cast<std::size_t>(std::count_if(pieces_.begin(), pieces_.end(), isHole));
}

}  // namespace poll
