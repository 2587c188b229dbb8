// Reception and sending against one deadline.
#include "runtime/LineTransfer.h"

#include <algorithm>

namespace runtime {
namespace {

using std::chrono::nanoseconds;

Milliseconds notNegative(Milliseconds time) {
    return std::max(time, Milliseconds{0});
}

Transfer failedWait(WaitResult wait) {
    return wait == WaitResult::Gone ? Transfer::Gone : Transfer::TimedOut;
}

/// Hands all bytes to the line.
Transfer handOver(Line& line, std::span<const std::uint8_t> data, Line::TimePoint deadline) {
    while (!data.empty()) {
        const WaitResult wait = line.waitWritable(deadline);
        if (wait != WaitResult::Ready) return failedWait(wait);
        const Moved written = line.write(data);
        if (written.gone) return Transfer::Gone;
        data = data.subspan(written.count);
        if (written.count == 0 && line.now() >= deadline) return Transfer::TimedOut;
    }
    return Transfer::Complete;
}

/// Sleeps for as long as the line's own queue needs, instead of asking it all the time.
Transfer drain(Line& line, Line::TimePoint deadline, nanoseconds character) {
    constexpr nanoseconds kShortestSleep = std::chrono::milliseconds{1};
    while (const std::size_t unsent = line.unsent()) {
        const Line::TimePoint now = line.now();
        if (now >= deadline) return Transfer::TimedOut;
        const nanoseconds needed = character * static_cast<std::int64_t>(unsent);
        line.sleepUntil(std::min(deadline, now + std::max(needed, kShortestSleep)));
    }
    return Transfer::Complete;
}

}  // namespace

Transfer receiveOne(Line& line, std::uint8_t& byte, Milliseconds timeout) {
    const Line::TimePoint deadline = line.now() + notNegative(timeout);
    for (;;) {
        const WaitResult wait = line.waitReadable(deadline);
        if (wait != WaitResult::Ready) return failedWait(wait);
        std::uint8_t arrived = 0;
        const Moved read = line.read({&arrived, 1});
        if (read.gone) return Transfer::Gone;
        if (read.count == 1) {
            byte = arrived;
            return Transfer::Complete;
        }
        if (line.now() >= deadline) return Transfer::TimedOut;
    }
}

FrameEnd receiveRest(Line& line, std::span<std::uint8_t> buffer, Milliseconds timeout,
                     Milliseconds gap) {
    const Line::TimePoint start = line.now();
    const Line::TimePoint deadline = start + notNegative(timeout);
    Line::TimePoint silentAt = start + notNegative(gap);
    std::size_t count = 0;
    while (count < buffer.size()) {
        const WaitResult wait = line.waitReadable(std::min(deadline, silentAt));
        if (wait == WaitResult::Gone) return {Transfer::Gone, count};
        if (wait == WaitResult::TimedOut) break;
        const Moved read = line.read(buffer.subspan(count));
        if (read.gone) return {Transfer::Gone, count};
        count += read.count;
        const Line::TimePoint now = line.now();
        if (now >= deadline) return {Transfer::TimedOut, count};
        if (read.count > 0) silentAt = now + notNegative(gap);
    }
    const bool outOfTime = count < buffer.size() && deadline < silentAt;
    return {outOfTime ? Transfer::TimedOut : Transfer::Complete, count};
}

Transfer sendAll(Line& line, std::span<const std::uint8_t> data, nanoseconds allowed,
                 nanoseconds character) {
    const Line::TimePoint deadline = line.now() + allowed;
    Transfer result = handOver(line, data, deadline);
    if (result == Transfer::Complete) result = drain(line, deadline, character);
    if (result == Transfer::TimedOut) line.discardOutput();
    return result;
}

}  // namespace runtime
