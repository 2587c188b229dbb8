// What is known of tags, nodes and line at one moment. Plain values, owned by whoever asked.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "poll/BlockReader.h"

namespace poll {

/// What a tag's value is worth.
enum class Quality {
    Never,  ///< No value has come yet; `error` says why if a read has failed.
    Good,   ///< The last read brought the value.
    Stale,  ///< The device can't be heard: the value is that of `at`.
    Bad,    ///< The device was heard, but has no value for this tag; `error` says why.
};

struct TagState {
    Quality quality = Quality::Never;
    std::vector<std::uint8_t> value;           ///< Run-time form, of the last good read.
    std::chrono::system_clock::time_point at;  ///< The end of the last good read.
    ReadError error;                           ///< Of the last read; code 0 when it was good.
    std::uint64_t count = 0;                   ///< Good reads.
    /// When the device was lost. Set exactly while the quality is Stale.
    std::optional<std::chrono::system_clock::time_point> staleSince;
};

/// Since the line was started. Times are those of whole reads, from the call to its end.
struct NodeState {
    int node = 0;
    bool reachable = true;       ///< False while the node is only probed.
    std::uint64_t requests = 0;  ///< Those of reads and writes, without the driver's repetitions.
    std::uint64_t replies = 0;   ///< Replies that passed every check, exceptions among them.
    std::uint64_t timeouts = 0;  ///< Requests without any reply.
    std::uint64_t checkErrors = 0;  ///< Requests whose reply failed a check.
    /// By exception code; [0] counts those whose code the driver does not tell.
    std::array<std::uint64_t, 256> exceptions{};
    /// Repetitions that are certain: those of failed requests. Of a request that succeeded the
    /// driver does not tell how often it was sent.
    std::uint64_t retries = 0;
    std::chrono::nanoseconds p50{0}, p99{0}, max{0};  ///< Of answered requests.
    std::chrono::seconds unreachable{0};              ///< Altogether.
};

struct LineState {
    double load = 0;                    ///< Of the last 10 to 20 s; 1.0 is all of the line's time.
    std::chrono::nanoseconds cycle{0};  ///< Line time of one read of every block, as last measured.
    std::uint64_t cycles = 0;           ///< How often every block of a reachable node was read.
    std::uint64_t lateCycles = 0;       ///< Periods of blocks that went by without a read.
    bool open = false;
    std::string fault;  ///< Why the port is not open; "" when it is.
};

/// A tag has the index that it has in the list of places. Tags of one block are always those of
/// one read.
struct Snapshot {
    std::vector<TagState> tags;
    std::vector<NodeState> nodes;  ///< By number.
    LineState line;
};

}  // namespace poll
