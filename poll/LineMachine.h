// What one line does next. No thread, no sleep: whoever owns it steps it.
#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "poll/BlockReader.h"
#include "poll/Clock.h"
#include "poll/FaultWatch.h"
#include "poll/LineLedger.h"
#include "poll/LineSetup.h"
#include "poll/Refusals.h"
#include "poll/Schedule.h"
#include "poll/Snapshot.h"
#include "poll/ValueStore.h"
#include "poll/WriteQueue.h"

namespace poll {

/// Opens the port, polls, and waits to open it again when it has vanished. What comes first:
/// writes, then probes and blocks in the order in which they are due. Blocks that are read in parts
/// take turns with those that are due, so that looking for a hole holds up nobody. Threads:
/// snapshot() and write() any; all else one at a time.
class LineMachine {
  public:
    using TimePoint = Clock::TimePoint;

    /// @param clock  Outlives the machine.
    LineMachine(std::shared_ptr<const LineSetup> setup, std::unique_ptr<BlockSource> source,
                Clock& clock, FaultReport report);

    void adopt(const KnownTags& known) { values_.adopt(known); }

    /// Opens, writes or reads once; nothing when nothing is due.
    /// @return when it is to be called again; at once when that is not later than now.
    TimePoint step();
    /// Closes the port for good; writes that wait fail.
    void close();

    Snapshot snapshot() const;
    WriteResult write(std::size_t tag, std::vector<std::uint8_t> value) {
        return writes_.add(tag, std::move(value));
    }

  private:
    struct BlockWork {
        Refusals refusals;
        std::chrono::nanoseconds taken{0};  // In this round.
    };
    struct NodeWork {
        std::vector<std::size_t> blocks;  // Those that it is asked for.
        std::size_t probe = 0;            // The cheapest of them.
        bool isFaulty = false;            // And told to be so.
    };

    struct Outcome {
        std::vector<TagReading> readings;
        ReadError error;  // Code 0 when any tag has a value.
        Failure failure;
        TimePoint from, to;
    };

    void addBlock(const Block& block);
    bool open(TimePoint now);
    void loseLine(const std::string& fault);
    void doWrite(PendingWrite write);
    WriteOutcome send(const PendingWrite& write);
    bool work(TimePoint now);
    bool probe(TimePoint now);
    bool begin(TimePoint now);
    bool resume();
    bool isWorthIt(const Block& block) const;
    void proceed(std::size_t block);
    Outcome read(const Block& part);
    Outcome lookFor(const Block& part);
    template <class Reading>
    Outcome timed(Reading&& reading);
    void judge(std::size_t block, const Block& part, const Outcome& outcome);
    void accept(std::size_t block, const Block& part);
    bool refuse(std::size_t block, const Block& part, const Outcome& outcome);
    void keep(std::size_t block, const Block& part, const Outcome& outcome);
    void settle(const Transaction& transaction, const ReadError& error);
    void watchNode(int node, const Failure& failure, const ReadError& error);
    void loseNode(int node, const ReadError& error);
    void welcomeNode(int node);
    TimePoint nextMoment(TimePoint now) const;

    const std::shared_ptr<const LineSetup> setup_;
    const std::unique_ptr<BlockSource> source_;
    Clock& clock_;
    ValueStore values_;
    LineLedger ledger_;
    FaultWatch watch_;
    WriteQueue writes_;
    Schedule schedule_;
    std::vector<BlockWork> blocks_;
    std::map<int, NodeWork> nodes_;
    std::deque<std::size_t> unfinished_;  // Blocks in the middle of a round.
    bool resumeFirst_ = false;            // Whose turn it is when both could go on.
    bool isOpen_ = false;
    TimePoint reopenAt_{};
};

}  // namespace poll
