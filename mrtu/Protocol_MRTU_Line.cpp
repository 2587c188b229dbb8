// One exchange on the line: who is asked, how often, and which reply is accepted.
#include <algorithm>
#include <array>

#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"

using _MRTU::Fault;
using _MRTU::Frame;
using _MRTU::Message;
using _MRTU::Reply;

namespace {

/// What may follow the first byte of a reply.
constexpr int kMaxRest = 0x200;
/// A line that still delivers bytes after this many is babbling, and waiting does not end it.
constexpr int kMaxFlush = 65536;

}  // namespace

void Protocol_MRTU::pauseBefore(const Tag_MRTU& tag) const {
    if (const int delayMs = tag.nodeParams()->delay; delayMs != 0) multiTask_->sleep(delayMs);
}

bool Protocol_MRTU::modiconMode(const Tag_MRTU& tag) {
    bool on = false;
    overrides_.get("ModiconMode", tag.nodeId(), tag.nodeParams()->oneBased, on);
    return on;
}

std::uint16_t Protocol_MRTU::lineAddress(const Tag_MRTU& tag, int index) {
    const bool configured = tag.nodeParams()->oneBased;
    const bool inForce = modiconMode(tag);
    unsigned address = static_cast<unsigned>(index);
    if (!configured && inForce) --address;
    if (configured && !inForce) ++address;
    return static_cast<std::uint16_t>(address & 0xFFFFu);
}

std::uint8_t Protocol_MRTU::lineNode(const Tag_MRTU& tag) const {
    const auto node = static_cast<unsigned>(nodeOverrides_.replacementOf(tag.nodeId()));
    return static_cast<std::uint8_t>(node & 0xFFu);
}

/// Node, function and start address of a request, unless nobody may be asked now.
Fault Protocol_MRTU::beginRequest(const Tag_MRTU& tag, std::uint8_t function, int index,
                                  Message& request) {
    // A Stop() may have come while this thread waited for the line, and a Start() that has not yet
    // opened or set up the port.
    if (!started_) return _MRTU::kNotStarted;

    const std::uint16_t address = lineAddress(tag, index);
    const std::uint8_t node = lineNode(tag);
    if (node == _MRTU::kDisabledNode) return _MRTU::kNodeDisabled;
    if (node == _MRTU::kBroadcastNode && _MRTU::isRead(function)) return _MRTU::kBroadcast;

    request.put(node);
    request.put(function);
    request.putWord(address);
    return _MRTU::kNoFault;
}

/// Asks until a good frame comes or no attempt is left.
void Protocol_MRTU::exchange(const Tag_MRTU& tag, const Message& request, Reply& reply) {
    const _MRTU::NodeParams& node = *tag.nodeParams();
    const bool ascii = tag.commonParams()->isAscii();
    const Frame frame = ascii ? _MRTU::frameAscii(request.view()) : _MRTU::frameRtu(request.view());
    reply.checkLength = ascii ? _MRTU::kLrcLength : _MRTU::kCrcLength;

    for (int left = node.repeat; left >= 0 && !reply.accepted; --left) {
        flushInput();
        port_->send(frame.bytes.data(), frame.length);
        receiveReply(node, ascii, reply);
    }
}

void Protocol_MRTU::flushInput() {
    unsigned char late = 0;
    for (int bytes = 0; bytes < kMaxFlush && port_->receiveByte(&late, 0, 0) != 0; ++bytes) {
    }
}

/// Waits for one reply.
void Protocol_MRTU::receiveReply(const _MRTU::NodeParams& node, bool ascii, Reply& reply) {
    std::array<unsigned char, 1 + kMaxRest> raw;
    reply.received = 0;
    if (port_->receiveByte(raw.data(), node.timeout, 0) == 0) return;

    int rest = 0;
    const int gapMs = lineSetting(&_MRTU::LineSettings::gapMs);
    const int ok = port_->receiveFrame(raw.data() + 1, kMaxRest, node.timeout, gapMs, &rest, 0);
    rest = std::clamp(rest, 0, kMaxRest);
    reply.received = 1 + rest;
    if (ok == 0) return;
    const _MRTU::ByteView received(raw.data(), static_cast<std::size_t>(reply.received));
    reply.accepted =
        ascii ? _MRTU::acceptAscii(received, reply) : _MRTU::acceptRtu(received, reply);
}
