#include "sim/Receiver.h"

#include <utility>

namespace sim {
namespace {

/// Who sends no faster than the line can carry never waits for it.
constexpr Nanos kReadAhead = std::chrono::seconds(1);

}  // namespace

Receiver::Receiver(wire::Mode mode, wire::RequestLength requestLength, wire::LineRate rate,
                   Nanos silence)
    : splitter_(mode, std::move(requestLength)), rate_(rate), silence_(silence) {}

void Receiver::add(wire::ByteView bytes, Instant now) {
    const bool pause = now > lastArrival_;
    if (pause) start_ = now;
    if (pause) characters_ = 0;
    for (std::size_t i = 0; i < bytes.size(); ++i) {
        // Always from the start, so that no rounding adds up.
        lastArrival_ = start_ + wire::timeOfCharacters(++characters_, rate_);
        for (wire::Received& frame : splitter_.add(bytes.subspan(i, 1)))
            arrivals_.push_back({.frame = std::move(frame), .at = lastArrival_});
    }
}

Instant Receiver::next() const {
    return arrivals_.empty() ? silenceEnd() : arrivals_.front().at;
}

std::optional<Arrival> Receiver::take(Instant now) {
    const Instant at = next();
    if (at > now) return std::nullopt;
    if (arrivals_.empty()) return Arrival{.frame = *splitter_.silence(), .at = at};
    Arrival arrival = std::move(arrivals_.front());
    arrivals_.pop_front();
    return arrival;
}

Instant Receiver::hasRoomFrom() const {
    return lastArrival_ - kReadAhead;
}

Instant Receiver::silenceEnd() const {
    return splitter_.waitsForSilence() ? lastArrival_ + silence_ : kNever;
}

}  // namespace sim
