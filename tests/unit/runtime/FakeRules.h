// A protocol of three bytes and more, as far from Modbus as the port allows.
#pragma once

#include <algorithm>
#include <vector>

#include "runtime/ReplyRules.h"

/// Request: node (0: everybody), number of bytes asked for, a name of its own. Reply: node, number
/// of bytes, the bytes; 0xEE among them means that the line has spoilt it.
class FakeRules final : public runtime::ReplyRules {
  public:
    using Bytes = std::vector<std::uint8_t>;

    static Bytes request(std::uint8_t node, std::uint8_t length, std::uint8_t name) {
        return {node, length, name};
    }
    static Bytes reply(std::uint8_t node, std::uint8_t length, std::uint8_t value = 0x11) {
        Bytes frame{node, length};
        frame.resize(frame.size() + length, value);
        return frame;
    }
    static constexpr std::uint8_t kSpoilt = 0xEE;

    std::optional<std::uint8_t> addressee(runtime::ByteView request) const override {
        if (request.empty() || request[0] == 0) return std::nullopt;
        return request[0];
    }
    std::size_t replyLength(runtime::ByteView request, runtime::ByteView received) const override {
        if (request.empty()) return 0;
        for (std::size_t i = 0; i < std::min<std::size_t>(2, received.size()); ++i) {
            if (received[i] != request[i]) return 0;
        }
        return std::size_t{2} + request[1];
    }
    bool isWhole(runtime::ByteView request, runtime::ByteView received) const override {
        return answers(request, received) == runtime::Answer::Yes;
    }
    runtime::Answer answers(runtime::ByteView request, runtime::ByteView frame) const override {
        if (replyLength(request, frame) == 0) return runtime::Answer::No;
        if (frame.size() != replyLength(request, frame)) return runtime::Answer::No;
        const bool spoilt = frame.size() > 2 && frame[2] == kSpoilt;
        return spoilt ? runtime::Answer::Damaged : runtime::Answer::Yes;
    }
    bool confusable(runtime::ByteView one, runtime::ByteView other) const override {
        return one[0] == other[0] && one[1] == other[1];
    }
    std::chrono::nanoseconds silence(runtime::ByteView, int, int) const override {
        return std::chrono::milliseconds{4};
    }
};
