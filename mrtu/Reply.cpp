#include "mrtu/Reply.h"

#include <algorithm>

namespace _MRTU {

namespace {

/// Lays a frame over the one before; what is longer than the buffer is cut.
void keep(ByteView frame, Reply& reply) {
    reply.length = static_cast<int>(frame.size());
    std::copy_n(frame.begin(), std::min(frame.size(), reply.bytes.size()), reply.bytes.begin());
}

/// The check of the last resort, a CRC in both modes.
bool holdsCrcFrame(const Reply& reply) {
    const std::size_t held = std::min(static_cast<std::size_t>(reply.length), reply.bytes.size());
    return isGoodRtuFrame({reply.bytes.data(), held});
}

/// Length of the frame and byte count. A count of more than 255 never matches.
bool holdsData(const Reply& reply, long long dataLength) {
    constexpr int kHeader = 1 + 1 + 1;  // node, function, byte count
    return reply.length == dataLength + kHeader + reply.checkLength &&
           reply.bytes[2] == dataLength && reply.length <= kMaxFrame;
}

bool sameWord(const Message& request, const Reply& reply, std::size_t at) {
    return request[at] == reply.bytes[at] && request[at + 1] == reply.bytes[at + 1];
}

constexpr std::size_t kOffsetAt = 2;
constexpr std::size_t kCountAt = 4;  // of a single write its value

}  // namespace

// Top to bottom, the first that fails is the answer.
Fault checkReply(const Message& request, const Reply& reply, long long dataLength) {
    const std::uint8_t function = request.function();

    // Length and check, which an accepted frame has passed.
    if (!reply.accepted && reply.received == 0) return kNoResponse;
    if (!reply.accepted && reply.received < kMinFrame) return kTooShort;
    if (!reply.accepted && !holdsCrcFrame(reply)) return kChecksum;
    // Node, exception, function.
    if (reply.bytes[0] != request.node()) return kNode;
    if (reply.bytes[1] == (function | kExceptionBit)) return {-6, getExceptionText(reply.bytes[2])};
    if (reply.bytes[1] != function) return kOperation;
    // The data of a read, the acknowledgement of a write.
    if (isRead(function)) return holdsData(reply, dataLength) ? kNoFault : kDataLength;
    if (!sameWord(request, reply, kOffsetAt)) return kOffset;
    if (!sameWord(request, reply, kCountAt)) return isSingleWrite(function) ? kAcknowledge : kCount;
    return kNoFault;
}

bool acceptRtu(ByteView received, Reply& reply) {
    if (received.size() < static_cast<std::size_t>(kMinFrame)) return false;
    keep(received, reply);
    return isGoodRtuFrame(received);
}

bool acceptAscii(ByteView received, Reply& reply) {
    const AsciiBytes decoded = decodeAscii(received);
    if (decoded.length == 0) return false;
    keep({decoded.bytes.data(), static_cast<std::size_t>(decoded.length)}, reply);
    return isGoodAsciiFrame(decoded);
}

}  // namespace _MRTU

const char* getExceptionText(unsigned char code) {
    struct Row {
        unsigned char code;
        const char* text;
    };
    // Source of the codes: Modbus Application Protocol V1.1b3, 7.
    static constexpr Row kRows[] = {
        {1, "Exception: Illegal function"},
        {2, "Exception: Illegal data address"},
        {3, "Exception: Illegal data value"},
        {4, "Exception: Failure in device"},
        {5, "Exception: server needs more time to finish"},
        {6, "Exception: server device busy"},
        {8, "Exception: parity error in target memory"},
        {10, "Exception: gateway: path to target unavailable"},
        {11, "Exception: gateway: timeout from target"},
    };
    for (const Row& row : kRows)
        if (row.code == code) return row.text;
    return "Unknown exception";
}
