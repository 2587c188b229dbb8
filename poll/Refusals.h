// Which parts of a block its device has. Pure: the moments are passed in.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <span>
#include <vector>

#include "poll/Plan.h"

namespace poll {

/// Reads one block of the plan in rounds. As long as the device accepts the block, a round is one
/// read. After the second refusal in a row the round goes on with halves, halves of halves, until
/// the tags are found that the device refuses. These holes are left out from then on, their sound
/// neighbours are joined again as far as the device accepts it, and after a time the whole block
/// and then some of its holes are tried once more.
///
/// Usage: begin(), then next() and one of accepted(), refused(), failed() until next() has none.
class Refusals {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;
    using Duration = std::chrono::nanoseconds;

    /// Refusals in a row before a block is split.
    static constexpr int kPatience = 2;
    /// Holes that one round tries again, so that many of them do not hold up the line.
    static constexpr int kTrials = 8;

    /// @param block, places  Outlive this object.
    Refusals(const Block& block, std::span<const TagPlace> places, Duration retry)
        : block_(&block), places_(places), retry_(retry) {}

    void begin(TimePoint now);
    /// @return what is to be read now, until the next call; null when the round has ended.
    const Block* next();

    void accepted();
    enum class Verdict {
        Once,   ///< It may have been a mistake: the tags are asked for again in the next round.
        Hole,   ///< The one tag of this read is left out from now on.
        Parts,  ///< The round goes on with parts of this read.
    };
    Verdict refused(TimePoint now);
    /// Noise, silence: says nothing of what the device has.
    void failed();
    /// The device may be another one now: what was refused is tried in the next round.
    void retrySoon() { retryAt_ = {}; }
    /// Ends a round half way.
    void stop() { busy_ = false; }

    [[nodiscard]] bool busy() const { return busy_; }
    [[nodiscard]] bool isSplit() const { return !pieces_.empty(); }
    [[nodiscard]] std::size_t holes() const;

  private:
    struct Piece {
        std::size_t from = 0, to = 0;  // Of the block's tags.
        enum class State { Suspect, Good, Hole } state = State::Suspect;
        int refusals = 0;    // In a row; of a good one.
        bool apart = false;  // What it makes with the next one is refused.
    };
    enum class Attempt { Whole, Joined, Piece };

    const Block* show(Attempt attempt, std::size_t from, std::size_t to);
    bool joinable() const;
    bool isDue(const Piece& piece);
    void skipHoles();
    Verdict refusedWhole(TimePoint now);
    void planTrials();
    Verdict refusedPiece();
    void halve(const Piece& piece);

    const Block* block_;
    std::span<const TagPlace> places_;
    Duration retry_;
    int refusals_ = 0;           // In a row; while the block is whole.
    std::vector<Piece> pieces_;  // By tag; empty while the block is whole.
    TimePoint retryAt_{};

    // The round.
    bool busy_ = false;
    bool tryWhole_ = false;
    int trials_ = 0;             // Holes that may still be tried.
    std::size_t nextTrial_ = 0;  // The tag whose hole is the next to be tried.
    std::size_t at_ = 0;         // The piece that is read next.
    Attempt attempt_ = Attempt::Whole;
    Block shown_;
};

}  // namespace poll
