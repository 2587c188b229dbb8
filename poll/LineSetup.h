// What a line is to poll.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "poll/BlockReader.h"
#include "poll/Plan.h"

namespace poll {

/// How patient a line is. The defaults suit a panel.
struct Patience {
    int failures = 3;  ///< Failed requests in a row after which a node is only probed, 1..
    std::chrono::milliseconds firstProbe{500};      ///< Pause in front of the first probe ...
    std::chrono::milliseconds longestPause{10000};  ///< ... doubling up to this.
    std::chrono::milliseconds reopen{1000};         ///< Between attempts to open a lost port.
    std::chrono::milliseconds holeRetry{60000};     ///< Until refused items are asked for again.

    bool operator==(const Patience&) const = default;
};

/// One line: its tags and their plan, ready to be polled.
struct LineSetup {
    std::string name;                   ///< Of the line, unique; usually the port's.
    std::string configuration;          ///< Everything else that shapes the line; only compared.
    std::vector<std::string> tagNames;  ///< By tag, unique among all lines.
    std::vector<std::string> uris;      ///< By tag.
    std::vector<TagPlace> places;       ///< By tag.
    std::vector<Block> blocks;          ///< Of the plan; every tag in at most one of them.
    int repeats = 0;                    ///< The driver's repetitions of a request that fails, 0..
    Patience patience;
};

/// A steady fault, told when it begins, changes and ends.
struct FaultEvent {
    enum class Kind { Begins, Changes, Ends };
    Kind kind = Kind::Begins;
    std::string line;     ///< Its name.
    std::string subject;  ///< "port", "node 5", "node 5 HREG 100..120".
    std::string text;     ///< What is wrong; of an end, what it was.
};

/// Called on the thread of the line, or by whoever steps it. May not call the poller back.
using FaultReport = std::function<void(const FaultEvent&)>;

/// Makes what a line is read through; the tags of its blocks have the setup's indices.
/// Throws std::runtime_error, whose text names the reason, when the setup can't be polled.
using SourceFactory = std::function<std::unique_ptr<BlockSource>(const LineSetup&)>;

/// @return what is wrong with the setups, naming line and tag; nothing when they can be polled.
std::optional<std::string> complaintAbout(const std::vector<LineSetup>& setups);

/// Whether the two poll the same tags in the same way. The blocks' reasons do not matter.
bool sameWork(const LineSetup& a, const LineSetup& b);

}  // namespace poll
