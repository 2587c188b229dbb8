// Sending against one deadline.
#include "runtime/LineTransfer.h"

#include <algorithm>

namespace runtime {
namespace {

using std::chrono::nanoseconds;

/// Asks for room only when the line has not taken everything.
Transfer handOver(Line& line, std::span<const std::uint8_t> data, Line::TimePoint deadline) {
    while (!data.empty()) {
        const Moved written = line.write(data);
        if (written.gone) return Transfer::Gone;
        data = data.subspan(written.count);
        if (data.empty()) break;
        const WaitResult wait = line.waitWritable(deadline);
        if (wait == WaitResult::Gone) return Transfer::Gone;
        if (wait == WaitResult::TimedOut || line.now() >= deadline) return Transfer::TimedOut;
    }
    return Transfer::Complete;
}

/// Sleeps for as long as the line's own queue needs, instead of asking it all the time.
Transfer untilSent(Line& line, Line::TimePoint deadline, nanoseconds character) {
    constexpr nanoseconds kShortestSleep = std::chrono::milliseconds{1};
    while (const std::size_t unsent = line.unsent()) {
        const Line::TimePoint now = line.now();
        if (now >= deadline) return Transfer::TimedOut;
        const nanoseconds needed = character * static_cast<std::int64_t>(unsent);
        line.sleepUntil(std::min(deadline, now + std::max(needed, kShortestSleep)));
    }
    return Transfer::Complete;
}

Transfer orDiscarded(Line& line, Transfer how) {
    if (how == Transfer::TimedOut) line.discardOutput();
    return how;
}

}  // namespace

Transfer sendAll(Line& line, std::span<const std::uint8_t> data, Line::TimePoint deadline) {
    return orDiscarded(line, handOver(line, data, deadline));
}

Transfer drain(Line& line, Line::TimePoint deadline, nanoseconds characterTime) {
    return orDiscarded(line, untilSent(line, deadline, characterTime));
}

}  // namespace runtime
