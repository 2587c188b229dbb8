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

constexpr int kMinReply = 5;
constexpr int kCrcLength = 2;
constexpr int kLrcLength = 1;
/// What may follow the first byte of a reply.
constexpr int kMaxRest = 0x200;
/// A line that still delivers bytes after this many is babbling, and waiting does not end it.
constexpr int kMaxFlush = 65536;

/// Lays a frame over the one before; what is longer than the buffer is cut.
void keep(_MRTU::ByteView frame, Reply& reply) {
    reply.length = static_cast<int>(frame.size());
    std::copy_n(frame.begin(), std::min(frame.size(), reply.bytes.size()), reply.bytes.begin());
}

/// Takes over what was received, good or bad: after the last attempt the bytes are looked at again.
/// @return whether it is a good frame.
bool acceptRtu(_MRTU::ByteView received, Reply& reply) {
    if (received.size() < kMinReply) return false;
    keep(received, reply);
    return _MRTU::isGoodRtuFrame(received);
}

bool acceptAscii(_MRTU::ByteView received, Reply& reply) {
    const _MRTU::AsciiBytes decoded = _MRTU::decodeAscii(received);
    if (decoded.length == 0) return false;
    keep({decoded.bytes.data(), static_cast<std::size_t>(decoded.length)}, reply);
    return _MRTU::isGoodAsciiFrame(decoded);
}

/// The check of the last resort, a CRC in both modes.
bool holdsCrcFrame(const Reply& reply) {
    const std::size_t held = std::min(static_cast<std::size_t>(reply.length), reply.bytes.size());
    return _MRTU::isGoodRtuFrame({reply.bytes.data(), held});
}

Fault lastOutcome(int received, const Reply& reply) {
    if (received == 0) return _MRTU::kNoResponse;
    if (received < kMinReply) return _MRTU::kTooShort;
    return holdsCrcFrame(reply) ? _MRTU::kNoFault : _MRTU::kChecksum;
}

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

Fault Protocol_MRTU::exchange(const Tag_MRTU& tag, const Message& request, Reply& reply) {
    const _MRTU::NodeParams& node = *tag.nodeParams();
    const bool ascii = tag.commonParams()->isAscii();
    const Frame frame = ascii ? _MRTU::frameAscii(request.view()) : _MRTU::frameRtu(request.view());
    reply.checkLength = ascii ? kLrcLength : kCrcLength;

    int received = 0;
    bool accepted = false;
    for (int left = node.repeat; left >= 0 && !accepted; --left) {
        flushInput();
        port_->send(frame.bytes.data(), frame.length);
        received = receiveReply(node, ascii, reply, accepted);
    }
    if (!accepted)
        if (const Fault fault = lastOutcome(received, reply)) return fault;
    return _MRTU::checkCommon(request, reply);
}

void Protocol_MRTU::flushInput() {
    unsigned char late = 0;
    for (int bytes = 0; bytes < kMaxFlush && port_->receiveByte(&late, 0, 0) != 0; ++bytes) {
    }
}

/// Waits for one reply. @return the number of bytes or characters received.
int Protocol_MRTU::receiveReply(const _MRTU::NodeParams& node, bool ascii, Reply& reply,
                                bool& accepted) {
    std::array<unsigned char, 1 + kMaxRest> raw;
    if (port_->receiveByte(raw.data(), node.timeout, 0) == 0) return 0;

    int rest = 0;
    const int gapMs = lineSetting(&_MRTU::SerialSettings::gapMs);
    const int ok = port_->receiveFrame(raw.data() + 1, kMaxRest, node.timeout, gapMs, &rest, 0);
    rest = std::clamp(rest, 0, kMaxRest);
    if (ok != 0) {
        const _MRTU::ByteView received(raw.data(), static_cast<std::size_t>(1 + rest));
        accepted = ascii ? acceptAscii(received, reply) : acceptRtu(received, reply);
    }
    return 1 + rest;
}
