// Frames of serial Modbus: a message (node, function, data) packed for the line and found again in
// the stream of received bytes. Pure: no port, no clock.
#pragma once

#include <array>
#include <cstddef>
#include <functional>
#include <optional>
#include <vector>

#include "wire/Bytes.h"

namespace wire {

/// Bytes of the longest message: node, function, data. Source: Modbus over Serial Line
/// V1.02, 2.5.1.
inline constexpr std::size_t kMaxMessage = 1 + 1 + 252;

/// How long a frame with a message of `message` bytes is. RTU: with the CRC. ASCII: colon, two
/// characters for each byte and for the LRC, CR, LF.
constexpr std::size_t frameLength(Mode mode, std::size_t message) {
    return mode == Mode::Rtu ? message + 2 : 1 + 2 * (message + 1) + 2;
}

inline constexpr std::size_t kMaxRtuFrame = frameLength(Mode::Rtu, kMaxMessage);
inline constexpr std::size_t kMaxAsciiFrame = frameLength(Mode::Ascii, kMaxMessage);

/// @return the message with its check, as it travels in `mode`.
/// @param breakCheck  The check is spoilt (all its bits inverted), the rest is in order.
Bytes encodeFrame(Mode mode, ByteView message, bool breakCheck = false);

/// Room for what an ASCII frame says: a message and its LRC.
using MessageRoom = std::array<std::uint8_t, kMaxMessage + 1>;

/// Takes no memory.
/// @param room  Where an ASCII frame is decoded.
/// @return the message in a frame, a part of `raw` (RTU) or of `room` (ASCII). Empty when the frame
/// is damaged: too short or too long, a wrong check, and in ASCII a character other than 0-9 and
/// A-F.
ByteView messageIn(Mode mode, ByteView raw, MessageRoom& room);

/// A frame taken from the line.
struct Received {
    Bytes raw;      ///< What arrived, colon and check included.
    Bytes message;  ///< Node, function, data. Empty when the frame is damaged.

    bool damaged() const { return message.empty(); }
};

/// @return the frame read from `raw`, damaged where messageIn() finds no message.
Received decodeFrame(Mode mode, ByteView raw);

/// Tells from the first bytes of an RTU request how long it is, check included; nothing when more
/// bytes are needed or the function is unknown.
using RequestLength = std::function<std::optional<std::size_t>(ByteView)>;

/// Cuts the stream of received bytes into frames. RTU: a frame ends as soon as the length that its
/// own first bytes announce is there and the check is right, or at silence. ASCII: it begins at
/// the last colon and ends at CR LF; silence means nothing, so that a person can type a frame.
/// Threads: one at a time.
class FrameSplitter {
  public:
    FrameSplitter(Mode mode, RequestLength requestLength);

    /// @return the frames that these bytes complete.
    std::vector<Received> add(ByteView bytes);

    /// The line was silent for longer than a frame may pause.
    /// @return what had arrived in RTU mode; nothing in ASCII mode or when nothing had arrived.
    std::optional<Received> silence();

    /// Whether silence() would return a frame.
    bool waitsForSilence() const { return mode_ == Mode::Rtu && !pending_.empty(); }

  private:
    std::optional<Received> addRtu(std::uint8_t byte);
    std::optional<Received> addAscii(std::uint8_t character);

    Mode mode_;
    RequestLength requestLength_;
    Bytes pending_;
};

}  // namespace wire
