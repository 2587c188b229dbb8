// Several lines, polled side by side.
#pragma once

#include <cstdint>
#include <future>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "poll/Clock.h"
#include "poll/LineSetup.h"
#include "poll/Snapshot.h"
#include "poll/WriteQueue.h"

namespace poll {

class LinePoller;

/// What is known of one line. The setup names the tags of the snapshot.
struct LineView {
    std::shared_ptr<const LineSetup> setup;
    Snapshot snapshot;
};

/// Threads: any may call snapshot() and write(); start(), reload() and stop() belong to the owner.
class Poller {
  public:
    /// @param clock  Outlives the poller. @param report  May be empty. Reports come from the
    /// threads of the lines.
    Poller(SourceFactory factory, Clock& clock, FaultReport report);
    Poller(const Poller&) = delete;
    Poller& operator=(const Poller&) = delete;
    ~Poller();

    /// Begins to poll, and later polls something else. Lines whose work stays the same go on
    /// undisturbed; the others end between two reads, and tags of the same name and URI on a line
    /// of the same name keep what is known of them.
    /// @return nothing, or what is wrong with the setups: then nothing has changed.
    std::optional<std::string> reload(std::vector<LineSetup> setups);
    std::optional<std::string> start(std::vector<LineSetup> setups) {
        return reload(std::move(setups));
    }
    /// Returns when all ports are closed. What was known stays readable. No later
    /// reload().
    void stop();

    /// Lines in the order of the setups.
    std::vector<LineView> snapshot() const;
    /// Writes a value in run-time form, ahead of all reads that wait on the tag's line.
    /// @return nothing, or the error; code -1 for a name that no line has.
    WriteResult write(const std::string& tagName, std::vector<std::uint8_t> value);

  private:
    using Line = std::shared_ptr<LinePoller>;

    /// What reload() would put in force.
    struct Change {
        std::vector<Line> lines;    // All of them, in order.
        std::vector<Line> added;    // Not started yet.
        std::vector<Line> dropped;  // Still polling.
    };

    Change compare(std::vector<LineSetup> setups) const;
    void apply(Change change);
    std::vector<Line> lines() const;

    SourceFactory factory_;
    Clock& clock_;
    FaultReport report_;
    mutable std::mutex mutex_;  // Guards lines_, never held over a line's call.
    std::vector<Line> lines_;
};

}  // namespace poll
