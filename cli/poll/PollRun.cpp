// The loop around looking, showing and waiting.
#include "cli/poll/PollRun.h"

#include <algorithm>

namespace cli {
namespace {

using poll::Quality;
using poll::TagState;
using std::chrono::milliseconds;

/// So often are the files looked at.
constexpr std::chrono::seconds kFilesEvery{1};

void reload(Polled& polled, PollOutput& output) {
    if (const auto refusal = polled.reload()) {
        output.notice(*refusal + "; the plan in force stays");
        return;
    }
    output.changeTags(polled.tags());
    output.notice("configuration and tags are taken");
}

bool isPortFault(const poll::Snapshot& snapshot) {
    return !snapshot.line.open && !snapshot.line.fault.empty();
}

milliseconds untilNextLook(const PollLimits& limits, poll::Clock::TimePoint now,
                           poll::Clock::TimePoint start) {
    if (!limits.duration) return limits.pause;
    const auto left = std::chrono::ceil<milliseconds>(start + *limits.duration - now);
    return std::clamp(left, milliseconds(0), limits.pause);
}

}  // namespace

bool cyclesDone(const poll::Snapshot& snapshot, std::uint64_t cycles) {
    if (isPortFault(snapshot)) return true;
    const auto tried = [](const TagState& state) {
        return state.count > 0 || state.error.code != 0;
    };
    if (!std::all_of(snapshot.tags.begin(), snapshot.tags.end(), tried)) return false;
    const bool anyNode = std::any_of(snapshot.nodes.begin(), snapshot.nodes.end(),
                                     [](const poll::NodeState& node) { return node.reachable; });
    return cycles <= 1 || snapshot.line.cycles >= cycles || !anyNode;
}

ExitCode exitCodeOf(const poll::Snapshot& snapshot) {
    const auto failed =
        std::find_if(snapshot.tags.begin(), snapshot.tags.end(), [](const TagState& state) {
            return state.quality != Quality::Good || state.error.code != 0;
        });
    if (failed == snapshot.tags.end()) return ExitCode::Done;
    if (isPortFault(snapshot)) return ExitCode::Port;
    return exitCodeOf(failed->error.code);
}

ExitCode runPoll(Polled& polled, PollOutput& output, PollEvents& events, poll::Clock& clock,
                 const PollLimits& limits) {
    const auto start = clock.now();
    auto looked = start;
    output.changeTags(polled.tags());
    for (;;) {
        const poll::Snapshot snapshot = polled.snapshot();
        if (!output.show(polled.tags(), snapshot, clock.wall())) return ExitCode::Done;
        if (limits.cycles > 0 && cyclesDone(snapshot, limits.cycles)) return exitCodeOf(snapshot);
        const auto now = clock.now();
        if (limits.duration && now >= start + *limits.duration) return ExitCode::Done;

        const Happened happened = events.wait(untilNextLook(limits, now, start));
        if (happened.end || happened.outputGone || !output.take(happened)) return ExitCode::Done;
        const bool lookNow = clock.now() >= looked + kFilesEvery;
        if (lookNow) looked = clock.now();
        if (happened.reload || (lookNow && polled.filesChanged())) reload(polled, output);
    }
}

}  // namespace cli
