#include "mrtu/Reply.h"

namespace _MRTU {

namespace {

constexpr std::uint8_t kExceptionBit = 0x80;

bool isEchoed(std::uint8_t function) {
    return function == 5 || function == 6;
}

bool sameWord(const Message& request, const Reply& reply, std::size_t at) {
    return request[at] == reply.bytes[at] && request[at + 1] == reply.bytes[at + 1];
}

}  // namespace

Fault checkCommon(const Message& request, const Reply& reply) {
    if (reply.bytes[0] != request[0]) return kNode;
    if (reply.bytes[1] == (request[1] | kExceptionBit))
        return {-6, getExceptionText(reply.bytes[2])};
    if (reply.bytes[1] != request[1]) return kOperation;
    return kNoFault;
}

Fault checkReadBody(const Reply& reply, long long dataLength) {
    constexpr int kHeader = 1 + 1 + 1;  // node, function, byte count
    if (reply.length != dataLength + kHeader + reply.checkLength) return kDataLength;
    if (reply.bytes[2] != dataLength) return kDataLength;
    if (reply.length > kMaxFrame) return kDataLength;
    return kNoFault;
}

Fault checkWriteBody(const Message& request, const Reply& reply) {
    if (!sameWord(request, reply, 2)) return kOffset;
    if (sameWord(request, reply, 4)) return kNoFault;
    return isEchoed(request[1]) ? kAcknowledge : kCount;
}

}  // namespace _MRTU
