// The health and the statistics of a line and its nodes, shared by who polls and who looks.
#pragma once

#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "poll/Clock.h"
#include "poll/Failure.h"
#include "poll/LineSetup.h"
#include "poll/LineStatistics.h"
#include "poll/NodeHealth.h"
#include "poll/Snapshot.h"

namespace poll {

/// One request, or the requests of one read.
struct Transaction {
    int node = 0;
    int requests = 1;  ///< When it succeeds; 0: the driver answers by itself.
    Failure failure;
    Clock::TimePoint from, to;
};

/// Threads: any.
class LineLedger {
  public:
    using TimePoint = Clock::TimePoint;
    enum class Turn { None, Lost, Returned };

    LineLedger(const LineSetup& setup, TimePoint now);

    /// @return what became of the node by it.
    Turn enter(const Transaction& transaction);
    void blockDone(std::size_t block, std::chrono::nanoseconds taken);
    void blockSkipped(std::size_t block);
    void lateCycles(std::uint64_t altogether);
    void opened();
    /// All nodes count as reachable again until they have been asked.
    void closed(const std::string& fault, TimePoint now);

    [[nodiscard]] bool reachable(int node) const;
    /// @return the unreachable node whose probe is due first, and when.
    [[nodiscard]] std::optional<std::pair<int, TimePoint>> nextProbe() const;

    /// @return the longest time in which the node has ever answered; 0 when it never has.
    [[nodiscard]] std::chrono::nanoseconds longestAnswer(int node) const;

    [[nodiscard]] std::vector<NodeState> nodes(TimePoint now) const;
    [[nodiscard]] LineState line(TimePoint now) const;

  private:
    struct Node {
        bool isPolled = false;  // Else nothing would ever find out that it is back.
        NodeHealth health;
        NodeStatistics statistics;
    };

    mutable std::mutex mutex_;  // Guards all of it; a leaf.
    int repeats_;
    std::map<int, Node> nodes_;
    LineLoad load_;
    CycleMeter cycles_;
    LineState line_;  // But for what load_ and cycles_ know.
};

}  // namespace poll
