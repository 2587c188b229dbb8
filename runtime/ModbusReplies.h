// What a port may ask about serial Modbus.
#pragma once

#include "runtime/ReplyRules.h"

namespace runtime {

/// The rules of serial Modbus in both framings; which one it is, each request tells itself.
/// Takes no memory.
class ModbusReplies final : public ReplyRules {
  public:
    std::optional<std::uint8_t> addressee(ByteView request) const override;
    std::size_t replyLength(ByteView request, ByteView received) const override;
    bool isWhole(ByteView request, ByteView received) const override;
    Answer answers(ByteView request, ByteView frame) const override;
    bool confusable(ByteView one, ByteView other) const override;
    std::chrono::nanoseconds silence(ByteView request, int baud, int characterBits) const override;
};

}  // namespace runtime
