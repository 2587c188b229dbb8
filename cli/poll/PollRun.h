// A poll from its first moment to its end.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>

#include "cli/ExitCode.h"
#include "cli/poll/PollEvents.h"
#include "cli/poll/ShownTags.h"
#include "poll/Clock.h"

namespace cli {

/// What is polled.
class Polled {
  public:
    virtual ~Polled() = default;
    /// Does not change but by reload().
    [[nodiscard]] virtual const ShownTags& tags() const = 0;
    [[nodiscard]] virtual poll::Snapshot snapshot() const = 0;
    /// Reads configuration and tags again. @return why nothing was taken; what was polled goes on.
    virtual std::optional<std::string> reload() = 0;
    /// Tells whether a file has changed since it was read. Looks at the files.
    virtual bool filesChanged() = 0;
};

/// Where it is shown.
class PollOutput {
  public:
    virtual ~PollOutput() = default;
    /// @return false when nobody can see it any more.
    virtual bool show(const ShownTags& tags, const poll::Snapshot& snapshot,
                      std::chrono::system_clock::time_point now) = 0;
    /// @return false when the user has ended it.
    virtual bool take(const Happened& happened) = 0;
    /// Other tags than before.
    virtual void changeTags(const ShownTags& tags) = 0;
    /// Tells of what is no tag's state.
    virtual void notice(const std::string& text) = 0;
};

struct PollLimits {
    std::uint64_t cycles = 0;                        ///< 0: without an end.
    std::optional<std::chrono::seconds> duration{};  ///< None: without an end.
    std::chrono::milliseconds pause{100};            ///< Between two looks at what is polled.
};

/// Shows what is polled until a limit is reached, a signal or the user ends it, or the output is
/// gone.
/// @return with a number of cycles the exit code of the first tag in the list that failed, as
/// `read` has it; Done otherwise.
ExitCode runPoll(Polled& polled, PollOutput& output, PollEvents& events, poll::Clock& clock,
                 const PollLimits& limits);

/// @return whether every tag was tried as often as the cycles say. Tags of a silent node and tags
/// that have failed count as tried; a port that can't be opened ends it, too.
bool cyclesDone(const poll::Snapshot& snapshot, std::uint64_t cycles);

/// @return Done when all tags are good, else what the first of the others makes of it.
ExitCode exitCodeOf(const poll::Snapshot& snapshot);

}  // namespace cli
