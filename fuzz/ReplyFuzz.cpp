// Any bytes as a reply: decoded and checked without a byte touched that is not there.
#include <algorithm>

#include "mrtu/Reply.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const _MRTU::ByteView received(data, std::min<std::size_t>(size, 513));
    _MRTU::isGoodRtuFrame(received);
    const _MRTU::AsciiBytes decoded = _MRTU::decodeAscii(received);
    if (decoded.length > 0) _MRTU::isGoodAsciiFrame(decoded);

    _MRTU::Reply reply{.bytes = decoded.bytes, .length = decoded.length, .checkLength = 1};
    _MRTU::Message request;
    for (const std::uint8_t byte : received.first(std::min<std::size_t>(received.size(), 6)))
        request.put(byte);
    if (request.length() < 6) return 0;
    for (const bool accepted : {false, true}) {
        reply.accepted = accepted;
        reply.received = static_cast<int>(received.size());
        _MRTU::checkReply(request, reply, decoded.length - 4);
    }
    return 0;
}
