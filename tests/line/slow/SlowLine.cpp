#include "tests/line/slow/SlowLine.h"

#include <algorithm>
#include <stdexcept>
#include <utility>

#include "wire/FunctionCodes.h"

namespace slow {

using runtime::Moved;
using runtime::WaitResult;
using std::chrono::nanoseconds;

SlowLine::SlowLine(const NodesOptions& options)
    : options_(options),
      slave_(options.nodes),
      splitter_(options.mode, [this](wire::ByteView bytes) { return slave_.requestLength(bytes); }),
      random_(options.seed) {}

void SlowLine::setDead(std::uint8_t node, bool dead) {
    if (dead) {
        dead_.insert(node);
        std::erase_if(deeds_, [node](const Deed& deed) {
            return !deed.request.empty() && deed.request[0] == node;
        });
    } else {
        dead_.erase(node);
    }
}

nanoseconds SlowLine::timeOf(std::size_t characters) const {
    return wire::timeOfCharacters(characters,
                                  {options_.baud, wire::standardCharacterBits(options_.mode)});
}

Ms SlowLine::nextLatency() {
    if (options_.jitterMs == 0) return Ms{options_.latencyMs};
    const auto range = static_cast<unsigned>(2 * options_.jitterMs + 1);
    const int jitter = static_cast<int>(random_() % range) - options_.jitterMs;
    return Ms{std::max(0, options_.latencyMs + jitter)};
}

Moved SlowLine::write(std::span<const std::uint8_t> data) {
    requestsOnWire_ = std::max(requestsOnWire_, now_);
    for (const std::uint8_t byte : data) {
        requestsOnWire_ += timeOf(1);
        for (const wire::Received& frame : splitter_.add({&byte, 1}))
            if (!frame.damaged()) accept(frame.message, requestsOnWire_);
    }
    return {data.size(), false};
}

void SlowLine::accept(const wire::Bytes& request, TimePoint at) {
    catchUp(at);
    ++requests_;
    const std::uint8_t node = request[0];
    if (dead_.contains(node) || (node != 0 && !slave_.hasNode(node))) return;
    if (options_.habit == Habit::Drops && at < busyUntil_) return;
    const TimePoint from = options_.habit == Habit::Delays ? at : std::max(at, busyUntil_);
    busyUntil_ = std::max(busyUntil_, from + nextLatency());
    schedule({busyUntil_, request, {}, options_.times});
}

void SlowLine::schedule(Deed deed) {
    const auto later = std::ranges::upper_bound(deeds_, deed.at, {}, &Deed::at);
    deeds_.insert(later, std::move(deed));
}

void SlowLine::perform(const Deed& deed) {
    if (!deed.request.empty()) return serve(deed);
    transmit(deed.reply, deed.at);
    if (deed.timesLeft > 1) {
        const int left = deed.timesLeft - (deed.timesLeft == NodesOptions::kForEver ? 0 : 1);
        schedule({deed.at + Ms{options_.againAfterMs}, {}, deed.reply, left});
    }
}

void SlowLine::serve(const Deed& deed) {
    const auto reply = slave_.answer(deed.request);
    noteChanges(deed.request, deed.at);
    if (!reply) return;
    if (deed.timesLeft == NodesOptions::kForEver)
        std::erase_if(deeds_, [](const Deed& other) { return other.request.empty(); });
    perform({deed.at, {}, wire::encodeFrame(options_.mode, *reply), deed.timesLeft});
}

void SlowLine::noteChanges(wire::ByteView request, TimePoint at) {
    const wire::FunctionRow* const row = wire::functionRow(request[1]);
    const bool writesWords = row != nullptr && (row->form == wire::Form::WriteWord ||
                                                row->form == wire::Form::WriteWords);
    constexpr std::size_t kPlainSingleWrite = 1 + 1 + 2 + 2;
    const bool writesLong =
        request.size() > kPlainSingleWrite && row != nullptr && row->form == wire::Form::WriteWord;
    if (!writesWords || writesLong || request[0] == 0) return;
    const auto first = static_cast<std::uint16_t>(request[2] << 8U | request[3]);
    const int count = row->form == wire::Form::WriteWord ? 1 : request[4] << 8U | request[5];
    for (int i = 0; i < count; ++i) {
        const auto address = static_cast<std::uint16_t>(first + i);
        changes_.push_back({at, address, holding(request[0], address)});
    }
}

void SlowLine::transmit(const wire::Bytes& frame, TimePoint from) {
    repliesOnWire_ = std::max(repliesOnWire_, from);
    for (const std::uint8_t byte : frame) {
        repliesOnWire_ += timeOf(1);
        arrivals_.push_back({repliesOnWire_, byte});
    }
    if (options_.habit != Habit::Delays) busyUntil_ = std::max(busyUntil_, repliesOnWire_);
}

void SlowLine::catchUp(TimePoint until) {
    while (!deeds_.empty() && deeds_.front().at <= until) {
        const Deed deed = std::move(deeds_.front());
        deeds_.pop_front();
        perform(deed);
    }
}

void SlowLine::catchUpToBytes(TimePoint until) {
    while (arrivals_.empty() && !deeds_.empty() && deeds_.front().at <= until)
        catchUp(deeds_.front().at);
}

WaitResult SlowLine::waitReadable(TimePoint until) {
    countWait();
    until = std::max(until, now_);
    catchUpToBytes(until);
    if (!arrivals_.empty() && arrivals_.front().at <= until) {
        now_ = std::max(now_, arrivals_.front().at);
        catchUp(now_);
        return WaitResult::Ready;
    }
    now_ = until;
    catchUp(now_);
    return WaitResult::TimedOut;
}

WaitResult SlowLine::waitWritable(TimePoint) {
    countWait();
    return WaitResult::Ready;
}

void SlowLine::sleepUntil(TimePoint until) {
    countWait();
    now_ = std::max(now_, until);
    catchUp(now_);
}

Moved SlowLine::read(std::span<std::uint8_t> buffer) {
    std::size_t count = 0;
    while (count < buffer.size() && !arrivals_.empty() && arrivals_.front().at <= now_) {
        buffer[count++] = arrivals_.front().byte;
        arrivals_.pop_front();
    }
    return {count, false};
}

std::size_t SlowLine::unsent() {
    if (requestsOnWire_ <= now_) return 0;
    const nanoseconds character = timeOf(1);
    return static_cast<std::size_t>((requestsOnWire_ - now_ + character - nanoseconds{1}) /
                                    character);
}

void SlowLine::discardInput() {
    while (!arrivals_.empty() && arrivals_.front().at <= now_)
        arrivals_.pop_front();
}

void SlowLine::countWait() {
    // A user that waits without the clock's moving would wait for ever.
    if (++waits_ > 50'000'000) throw std::logic_error("the line's user spins");
}

}  // namespace slow
