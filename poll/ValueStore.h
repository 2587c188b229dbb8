// The last values of a line's tags, for one writing thread and any number of readers.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>
#include <span>
#include <utility>
#include <vector>

#include "poll/BlockReader.h"
#include "poll/Plan.h"
#include "poll/Snapshot.h"

namespace poll {

/// What is known of tags, by index.
using KnownTags = std::vector<std::pair<std::size_t, TagState>>;

/// Readers copy what they ask for outside the lock, so that a long list never holds up the line;
/// the writer copies a block only while a reader still looks at it.
/// Threads: tags() any; all else the line's.
class ValueStore {
  public:
    using WallTime = std::chrono::system_clock::time_point;

    /// @param tags  How many there are. @param blocks  The plan; tags outside it stay Never.
    ValueStore(std::size_t tags, std::span<const Block> blocks);

    /// Takes what was known before. REQUIRES: no reader yet.
    void adopt(const KnownTags& known);

    /// Takes one read: a reader sees all of it or nothing.
    /// @param block  Index in the plan. @param tags, readings  Of that block, in one order.
    /// @param heard  Whether the device answered: what failed is then Bad, else Stale.
    void take(std::size_t block, std::span<const std::size_t> tags,
              std::span<const TagReading> readings, bool heard, WallTime at);
    /// Nothing more will come for a while: tags of the block that have a value become Stale, the
    /// others stay Never.
    void lose(std::size_t block, const ReadError& error, WallTime at);

    [[nodiscard]] std::vector<TagState> tags() const;

  private:
    using States = std::vector<TagState>;

    struct Home {
        std::size_t block = 0;
        std::size_t at = 0;
    };

    States& writable(std::size_t block);
    TagState& state(States& states, std::size_t tag) { return states[homes_[tag].at]; }

    mutable std::mutex mutex_;  // Guards groups_, and every last reference to one of them.
    std::vector<std::shared_ptr<States>> groups_;  // One a block; the last: tags in no block.
    std::vector<Home> homes_;                      // By tag.
};

}  // namespace poll
