#include "runtime/ModbusReplies.h"

#include "wire/Replies.h"
#include "wire/Times.h"

namespace runtime {
namespace {

Answer answerOf(wire::Answering answering) {
    switch (answering) {
        case wire::Answering::Yes:
            return Answer::Yes;
        case wire::Answering::Damaged:
            return Answer::Damaged;
        case wire::Answering::No:
            break;
    }
    return Answer::No;
}

}  // namespace

std::optional<std::uint8_t> ModbusReplies::addressee(ByteView request) const {
    const auto asked = wire::requestIn(request);
    if (!asked || asked->isBroadcast()) return std::nullopt;
    return asked->node;
}

std::size_t ModbusReplies::replyLength(ByteView request, ByteView received) const {
    const auto asked = wire::knownRequestIn(request);
    return asked ? wire::replyLength(*asked, received) : 0;
}

bool ModbusReplies::isWhole(ByteView request, ByteView received) const {
    const auto asked = wire::knownRequestIn(request);
    return asked && wire::isWholeReply(*asked, received);
}

Answer ModbusReplies::answers(ByteView request, ByteView frame) const {
    const auto asked = wire::knownRequestIn(request);
    return asked ? answerOf(wire::answering(*asked, frame)) : Answer::No;
}

bool ModbusReplies::confusable(ByteView one, ByteView other) const {
    const auto first = wire::knownRequestIn(one);
    const auto second = wire::knownRequestIn(other);
    return first && second && wire::confusable(*first, *second);
}

std::chrono::nanoseconds ModbusReplies::silence(ByteView request, int baud,
                                                int characterBits) const {
    // Colon and line end separate the frames of the ASCII mode.
    const auto asked = wire::knownRequestIn(request);
    if (asked && asked->mode == wire::Mode::Ascii) return std::chrono::nanoseconds{0};
    return wire::silenceBetweenFrames({baud, characterBits});
}

}  // namespace runtime
