#include "wire/Framing.h"

#include <utility>

#include "wire/Checksum.h"
#include "wire/Hex.h"

namespace wire {
namespace {

constexpr std::size_t kMinMessage = 1 + 1;  // Node and function.

Bytes encodeRtu(ByteView message, bool breakCheck) {
    const auto crc = static_cast<std::uint16_t>(crc16(message) ^ (breakCheck ? 0xFFFFU : 0U));
    Bytes frame(message.begin(), message.end());
    frame.push_back(static_cast<std::uint8_t>(crc & 0xFFU));
    frame.push_back(static_cast<std::uint8_t>(crc >> 8U));
    return frame;
}

Bytes encodeAscii(ByteView message, bool breakCheck) {
    Bytes frame{':'};
    for (const std::uint8_t byte : message)
        putHex(frame, byte);
    putHex(frame, static_cast<std::uint8_t>(lrc8(message) ^ (breakCheck ? 0xFFU : 0U)));
    frame.push_back('\r');
    frame.push_back('\n');
    return frame;
}

ByteView messageInRtu(ByteView raw) {
    if (raw.size() < frameLength(Mode::Rtu, kMinMessage) || raw.size() > kMaxRtuFrame) return {};
    const ByteView message = raw.first(raw.size() - 2);
    const unsigned low = raw[raw.size() - 2];
    const unsigned high = raw[raw.size() - 1];
    if (crc16(message) != (high << 8U | low)) return {};
    return message;
}

ByteView messageInAscii(ByteView raw, MessageRoom& room) {
    if (raw.size() < frameLength(Mode::Ascii, kMinMessage) || raw.size() > kMaxAsciiFrame)
        return {};
    if (raw[0] != ':' || raw[raw.size() - 2] != '\r' || raw[raw.size() - 1] != '\n') return {};
    const auto count = bytesInHex(raw.subspan(1, raw.size() - 3), room);
    if (!count) return {};
    const ByteView message = ByteView(room).first(*count - 1);
    if (lrc8(message) != room[*count - 1]) return {};
    return message;
}

}  // namespace

Bytes encodeFrame(Mode mode, ByteView message, bool breakCheck) {
    return mode == Mode::Rtu ? encodeRtu(message, breakCheck) : encodeAscii(message, breakCheck);
}

ByteView messageIn(Mode mode, ByteView raw, MessageRoom& room) {
    return mode == Mode::Rtu ? messageInRtu(raw) : messageInAscii(raw, room);
}

Received decodeFrame(Mode mode, ByteView raw) {
    MessageRoom room;
    const ByteView message = messageIn(mode, raw, room);
    return {.raw = Bytes(raw.begin(), raw.end()), .message = Bytes(message.begin(), message.end())};
}

FrameSplitter::FrameSplitter(Mode mode, RequestLength requestLength)
    : mode_(mode), requestLength_(std::move(requestLength)) {}

std::vector<Received> FrameSplitter::add(ByteView bytes) {
    std::vector<Received> frames;
    for (const std::uint8_t byte : bytes) {
        auto frame = mode_ == Mode::Rtu ? addRtu(byte) : addAscii(byte);
        if (frame) frames.push_back(*std::move(frame));
    }
    return frames;
}

std::optional<Received> FrameSplitter::silence() {
    if (!waitsForSilence()) return std::nullopt;
    return decodeFrame(mode_, std::exchange(pending_, {}));
}

std::optional<Received> FrameSplitter::addRtu(std::uint8_t byte) {
    // One byte too many already makes a frame that nobody can accept; more would only cost memory.
    if (pending_.size() > kMaxRtuFrame) return std::nullopt;
    pending_.push_back(byte);
    if (requestLength_(pending_) != pending_.size()) return std::nullopt;
    auto frame = decodeFrame(mode_, pending_);
    // The length itself may be corrupted, so only silence can end a damaged frame.
    if (frame.damaged()) return std::nullopt;
    pending_.clear();
    return frame;
}

std::optional<Received> FrameSplitter::addAscii(std::uint8_t character) {
    if (character == ':') pending_.clear();
    if (pending_.empty() && character != ':') return std::nullopt;
    pending_.push_back(character);
    const bool atEnd = character == '\n' && pending_[pending_.size() - 2] == '\r';
    if (!atEnd && pending_.size() <= kMaxAsciiFrame) return std::nullopt;
    return decodeFrame(mode_, std::exchange(pending_, {}));
}

}  // namespace wire
