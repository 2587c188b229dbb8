#include "sim/Fault.h"

#include <algorithm>
#include <utility>

#include "wire/Framing.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::ByteView;
using wire::Mode;

Bytes spoiltFrame(Mode mode, ByteView reply, const Fault& fault) {
    Bytes message(reply.begin(), reply.end());
    if (fault.wrongNode && !message.empty()) ++message[0];
    return fault.replacement.value_or(wire::encodeFrame(mode, message, fault.wrongCheck));
}

}  // namespace

Transmission transmit(Mode mode, ByteView reply, const Fault& fault) {
    Bytes frame = spoiltFrame(mode, reply, fault);
    const std::size_t whole = fault.hangUp ? 0 : frame.size();
    frame.resize(std::min(frame.size(), fault.keep.value_or(whole)));
    frame.insert(frame.begin(), fault.noise.begin(), fault.noise.end());
    return {.bytes = std::move(frame),
            .delayMs = fault.delayMs,
            .dripBytes = fault.dripBytes,
            .dripGapMs = fault.dripGapMs,
            .hangUp = fault.hangUp};
}

void FaultQueue::add(Fault fault) {
    if (fault.times < 1) return;
    const std::lock_guard lock(mutex_);
    faults_.push_back(std::move(fault));
}

std::optional<Fault> FaultQueue::take(std::uint8_t node) {
    const std::lock_guard lock(mutex_);
    const auto due = std::find_if(faults_.begin(), faults_.end(), [&](const Fault& fault) {
        return fault.node == 0 || fault.node == node;
    });
    if (due == faults_.end()) return std::nullopt;
    Fault fault = *due;
    if (--due->times == 0) faults_.erase(due);
    return fault;
}

void FaultQueue::clear() {
    const std::lock_guard lock(mutex_);
    faults_.clear();
}

bool FaultQueue::empty() const {
    const std::lock_guard lock(mutex_);
    return faults_.empty();
}

}  // namespace sim
