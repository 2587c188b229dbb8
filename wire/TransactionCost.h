// What a transaction costs on a serial line: its characters, its silences, its time. Pure. Nothing
// is rounded down, and the time grows by the same for each character, so that who plans may add and
// compare.
#pragma once

#include <algorithm>
#include <chrono>
#include <cstddef>

#include "wire/Framing.h"
#include "wire/FunctionCodes.h"
#include "wire/Times.h"

namespace wire {

/// Bytes that `bits` bits are packed into.
constexpr std::size_t packedBytes(std::size_t bits) {
    return (bits + 7) / 8;
}

/// Bytes of data that `count` items make.
/// @param registerBytes  Of one register: 2, or 4 where registers have 32 bits. Bits need none.
constexpr std::size_t dataBytes(Form form, std::size_t count,
                                std::size_t registerBytes = kRegisterBytes) {
    const bool bits = form == Form::ReadBits || form == Form::WriteBit || form == Form::WriteBits;
    return bits ? packedBytes(count) : count * registerBytes;
}

/// Bytes of a request's message: node, function, address, and what follows; see Form.
/// @param count  Items that it reads or writes; a single write has one.
constexpr std::size_t requestMessage(Form form, std::size_t count,
                                     std::size_t registerBytes = kRegisterBytes) {
    constexpr std::size_t kFront = 1 + 1 + 2;
    switch (form) {
        case Form::ReadBits:
        case Form::ReadWords:
        case Form::WriteBit:
            return kFront + 2;
        case Form::WriteWord:
            return kFront + registerBytes;
        case Form::WriteBits:
        case Form::WriteWords:
            break;
    }
    return kFront + 2 + 1 + dataBytes(form, count, registerBytes);
}

/// Bytes of the message that answers: node, function, and what follows; see Form.
constexpr std::size_t replyMessage(Form form, std::size_t count,
                                   std::size_t registerBytes = kRegisterBytes) {
    if (isRead(form)) return 1 + 1 + 1 + dataBytes(form, count, registerBytes);
    if (isSingleWrite(form)) return requestMessage(form, count, registerBytes);
    return 1 + 1 + 2 + 2;
}

/// Bytes of the message of a refusal: node, function, code.
/// Source: Modbus Application Protocol V1.1b3, 7.
inline constexpr std::size_t kExceptionMessage = 1 + 1 + 1;

/// The characters of one transaction.
struct TransactionLength {
    std::size_t request;
    std::size_t reply;

    [[nodiscard]] constexpr std::size_t characters() const { return request + reply; }
};

constexpr TransactionLength transactionLength(Mode mode, Form form, std::size_t count,
                                              std::size_t registerBytes = kRegisterBytes) {
    return {frameLength(mode, requestMessage(form, count, registerBytes)),
            frameLength(mode, replyMessage(form, count, registerBytes))};
}

/// How long the line must be silent around a frame. The frames of the ASCII mode need none: colon
/// and line end part them.
constexpr std::chrono::nanoseconds silenceAround(Mode mode, LineRate rate) {
    return mode == Mode::Rtu ? silenceBetweenFrames(rate) : std::chrono::nanoseconds{0};
}

/// The pauses of a transaction, as far as they are known; 0: as short as the mode allows.
struct Pauses {
    std::chrono::nanoseconds before{0};      ///< Kept by the master in front of each request.
    std::chrono::nanoseconds turnaround{0};  ///< From the end of the request to the reply.
    std::chrono::nanoseconds after{0};       ///< By which the master sees the end of the reply.
};

/// The time that the pauses take. In RTU neither the slave nor the next request comes before the
/// silence that ends a frame.
constexpr std::chrono::nanoseconds pauseTime(Mode mode, LineRate rate, const Pauses& pauses) {
    const std::chrono::nanoseconds silence = silenceAround(mode, rate);
    return pauses.before + std::max(pauses.turnaround, silence) + std::max(pauses.after, silence);
}

/// The line's time for one transaction, from its first pause to the end of its last.
constexpr std::chrono::nanoseconds transactionTime(Mode mode, LineRate rate,
                                                   TransactionLength length,
                                                   const Pauses& pauses = {}) {
    return pauseTime(mode, rate, pauses) +
           timeOfCharacters(1, rate) * static_cast<std::int64_t>(length.characters());
}

}  // namespace wire
