#include "wire/Replies.h"

#include <algorithm>

#include "wire/Framing.h"
#include "wire/Hex.h"

namespace wire {
namespace {

constexpr std::size_t kHead = 1 + 1;              // Node, function.
constexpr std::size_t kAddressAndCount = 2 + 2;   // Or address and value.
constexpr std::size_t kException = kHead + 1;     // With its code.
constexpr std::size_t kBeforeValues = kHead + 1;  // With the byte count.
constexpr std::size_t kMostValues = 0xFF;         // A byte count can't say more.

/// Lengths of a good reply's message; 0 for one that there can't be.
struct GoodLengths {
    std::size_t usual;
    std::size_t withLongRegisters;  ///< The same as usual where there are none.

    bool contains(std::size_t length) const {
        return length != 0 && (length == usual || length == withLongRegisters);
    }
};

std::size_t readReply(std::size_t values) {
    return values <= kMostValues ? kBeforeValues + values : 0;
}

bool mayBeLong(const FunctionRow& row) {
    constexpr std::uint8_t kReadHoldingRegisters = 3;
    return row.code == kReadHoldingRegisters;
}

/// REQUIRES: the request has a row.
GoodLengths goodLengths(const Request& request) {
    if (request.row->form == Form::ReadBits) {
        const std::size_t length = readReply((request.count() + 7) / 8);
        return {length, length};
    }
    if (request.row->form == Form::ReadWords) {
        const std::size_t usual = readReply(request.count() * kRegisterBytes);
        if (!mayBeLong(*request.row)) return {usual, usual};
        return {usual, readReply(request.count() * kLongRegisterBytes)};
    }
    const std::size_t echo = kHead + request.fieldCount;
    return {echo, echo};
}

/// The row of the function, if so many bytes can stand behind it in a request.
const FunctionRow* rowOf(std::uint8_t function, std::size_t dataLength) {
    const FunctionRow* const row = functionRow(function);
    if (row == nullptr) return nullptr;
    const bool hasByteCount = !isRead(row->form) && !isSingleWrite(row->form);
    const bool isLongWrite = row->form == Form::WriteWord && dataLength == 2 + kLongRegisterBytes;
    const bool fits = hasByteCount ? dataLength > kAddressAndCount
                                   : dataLength == kAddressAndCount || isLongWrite;
    return fits ? row : nullptr;
}

Request requestOf(Mode mode, ByteView message) {
    Request request{.mode = mode, .node = message[0], .function = message[1]};
    const ByteView data = message.subspan(kHead);
    request.row = rowOf(request.function, data.size());
    if (request.row == nullptr) return request;
    request.fieldCount = isSingleWrite(request.row->form) ? data.size() : kAddressAndCount;
    std::copy_n(data.begin(), request.fieldCount, request.fields.begin());
    return request;
}

bool looksLikeAscii(ByteView bytes) {
    return bytes.size() >= 1 + 2 && bytes[0] == ':' && bytes[bytes.size() - 2] == '\r' &&
           bytes[bytes.size() - 1] == '\n';
}

std::optional<Request> asciiRequestIn(ByteView frame) {
    if (!looksLikeAscii(frame)) return std::nullopt;
    MessageRoom room;
    const ByteView message = messageIn(Mode::Ascii, frame, room);
    if (message.empty()) return std::nullopt;
    return requestOf(Mode::Ascii, message);
}

/// Node and function, then all that a write's reply can repeat.
using HeadRoom = std::array<std::uint8_t, kHead + 2 + kLongRegisterBytes>;

/// @return the first bytes of what the frame's beginning says, as many as are there whole; nothing
/// when it is no frame's beginning.
std::optional<ByteView> headIn(Mode mode, ByteView received, HeadRoom& room) {
    if (mode == Mode::Rtu) return received.first(std::min(received.size(), room.size()));
    if (received.empty()) return received;
    if (received[0] != ':') return std::nullopt;
    const auto digits =
        std::ranges::distance(received.begin() + 1, std::ranges::find(received, '\r'));
    const std::size_t count = std::min(static_cast<std::size_t>(digits) / 2, room.size());
    if (!bytesInHex(received.subspan(1, 2 * count), room)) return std::nullopt;
    return ByteView(room).first(count);
}

bool repeatsFields(const Request& request, ByteView behindFunction) {
    const std::size_t count = std::min(behindFunction.size(), request.fieldCount);
    return std::ranges::equal(behindFunction.first(count), ByteView(request.fields).first(count));
}

bool isException(const Request& request, std::uint8_t function) {
    return function == (request.function | kExceptionFlag);
}

/// Length of a good reply's message that begins so; 0 when none does.
/// REQUIRES: the request has a row; node and function are right.
std::size_t goodLength(const Request& request, ByteView head) {
    const GoodLengths lengths = goodLengths(request);
    if (!isRead(request.row->form))
        return repeatsFields(request, head.subspan(kHead)) ? lengths.usual : 0;
    if (head.size() == kHead) return lengths.usual;
    const std::size_t announced = kBeforeValues + head[kHead];
    return lengths.contains(announced) ? announced : 0;
}

/// Length of the message of a reply that begins so; 0 when none does.
/// REQUIRES: the request has a row.
std::size_t messageLength(const Request& request, ByteView head) {
    if (!head.empty() && head[0] != request.node) return 0;
    if (head.size() < kHead) return kException;  // No good reply is shorter.
    if (isException(request, head[1])) return kException;
    return head[1] == request.function ? goodLength(request, head) : 0;
}

bool hasGoodLength(const Request& request, std::size_t frame) {
    if (request.row == nullptr) return false;
    const auto [usual, withLongRegisters] = goodLengths(request);
    return (usual != 0 && frame == frameLength(request.mode, usual)) ||
           (withLongRegisters != 0 && frame == frameLength(request.mode, withLongRegisters));
}

/// REQUIRES: node and function are right.
bool isGoodReply(const Request& request, ByteView message) {
    if (request.row == nullptr) return true;
    return message.size() > kHead && goodLength(request, message) == message.size();
}

/// What reads that may be meant for long registers have in common: no power of two.
std::size_t oddPart(std::size_t count) {
    while (count != 0 && count % 2 == 0)
        count /= 2;
    return count;
}

/// REQUIRES: the same row.
bool sameGoodReplies(const Request& one, const Request& other) {
    if (one.row->form == Form::ReadBits) return (one.count() + 7) / 8 == (other.count() + 7) / 8;
    if (one.row->form != Form::ReadWords)
        return std::equal(one.fields.begin(), one.fields.begin() + kAddressAndCount,
                          other.fields.begin());
    if (mayBeLong(*one.row)) return oddPart(one.count()) == oddPart(other.count());
    return one.count() == other.count();
}

}  // namespace

std::optional<Request> requestIn(ByteView frame) {
    if (const auto request = asciiRequestIn(frame)) return request;
    MessageRoom room;
    const ByteView message = messageIn(Mode::Rtu, frame, room);
    if (message.empty()) return std::nullopt;
    return requestOf(Mode::Rtu, message);
}

std::optional<Request> knownRequestIn(ByteView frame) {
    if (const auto request = asciiRequestIn(frame)) return request;
    if (frame.size() < frameLength(Mode::Rtu, kHead)) return std::nullopt;
    return requestOf(Mode::Rtu, frame.first(frame.size() - frameLength(Mode::Rtu, 0)));
}

std::size_t replyLength(const Request& request, ByteView received) {
    if (request.isBroadcast() || request.row == nullptr) return 0;
    HeadRoom room;
    const auto head = headIn(request.mode, received, room);
    if (!head) return 0;
    const std::size_t length = messageLength(request, *head);
    return length == 0 ? 0 : frameLength(request.mode, length);
}

Answering answering(const Request& request, ByteView frame) {
    if (request.isBroadcast()) return Answering::No;
    MessageRoom room;
    const ByteView message = messageIn(request.mode, frame, room);
    if (message.empty())
        return hasGoodLength(request, frame.size()) ? Answering::Damaged : Answering::No;
    if (message[0] != request.node) return Answering::No;
    const bool right = isException(request, message[1])
                           ? message.size() == kException
                           : message[1] == request.function && isGoodReply(request, message);
    return right ? Answering::Yes : Answering::No;
}

bool isWholeReply(const Request& request, ByteView received) {
    if (request.isBroadcast()) return false;
    if (request.mode == Mode::Ascii) return looksLikeAscii(received);
    const std::size_t length = replyLength(request, received);
    return length != 0 && length == received.size() &&
           answering(request, received) == Answering::Yes;
}

bool confusable(const Request& one, const Request& other) {
    if (one.isBroadcast() || other.isBroadcast()) return false;
    if (one.mode != other.mode || one.node != other.node || one.function != other.function)
        return false;
    return one.row == nullptr || other.row == nullptr || sameGoodReplies(one, other);
}

}  // namespace wire
