// What happens on a line between two calls of a driver: requests leave when their replies can be
// told from others', replies are received whole.
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <span>
#include <string>

#include "runtime/CutReply.h"
#include "runtime/LineInput.h"
#include "runtime/LineTransfer.h"
#include "runtime/OwedReplies.h"
#include "runtime/ReplyRules.h"

namespace runtime {

/// What ends a received frame.
enum class FrameEndBy : std::uint8_t {
    Silence,  ///< The gap that the driver asks for.
    Length,   ///< The bytes are the whole reply to the request; the gap where they are none. Not
              ///< for lines that return what was sent: an echo may begin with a valid reply.
};

/// How a port treats what passes. The rules must be safe to use on any thread.
struct ExchangeOptions {
    std::string port;                         ///< "com1", in front of what is reported.
    std::shared_ptr<const ReplyRules> rules;  ///< Null: nothing is known of what passes.
    FrameEndBy frameEnd = FrameEndBy::Silence;
    Milliseconds gapFloor{0};  ///< The shortest silence that ends a frame.
    /// The longest wait for the first byte of a reply, in ms, whatever is asked for; it may change
    /// at any time. Null or 0: as long as is asked for.
    std::shared_ptr<const std::atomic<int>> longestWait;
    /// Told what people should know, each thing once: a node that answers later than is waited
    /// for, replies that are cut by pauses. Called on the thread that uses the port.
    std::function<void(const std::string&)> report;
    /// Shown each frame that was thrown away before anybody had a byte of it.
    std::function<void(ByteView)> thrownAway;
};

/// What was received of a frame.
struct FrameEnd {
    Transfer how;       ///< Complete: it is at its end, or the buffer is full.
    std::size_t count;  ///< Bytes stored, whatever the end was.
};

/// The operations of a port over a line. clearToSend(), transmit(), receiveByte(), receiveFrame()
/// and purge() come one at a time; setFormat() and forgetInput() may come beside any of them.
class LineExchange {
  public:
    using TimePoint = Line::TimePoint;

    /// The longest that clearToSend() waits.
    static constexpr std::chrono::seconds kLongestWait{5};
    /// The longest that a frame which nobody waits for may take to its end.
    static constexpr std::chrono::seconds kLongestStray{1};

    /// @param line  Must outlive this object.
    LineExchange(Line& line, ExchangeOptions options);

    /// @param characterBits  Start, data, parity and stop bits.
    void setFormat(int baud, int characterBits);
    /// What has been received is not taken.
    void forgetInput() { inputIsOld_ = true; }

    /// Waits until the request's reply can be told from all that is still to come. Without rules,
    /// or with nothing owed for which it could be mistaken, it does not wait.
    /// @return false when that can't be had in time: nothing should be sent, and the next
    /// receiveByte() tells at once that nothing came.
    bool clearToSend(ByteView request);
    /// Keeps the silence that the protocol demands, hands the bytes to the line and, with
    /// `untilSent`, waits until they are on the wire. Fails when that takes a second longer than
    /// the characters themselves do.
    Transfer transmit(ByteView request, bool untilSent);

    /// Waits for the first byte of a reply.
    /// @param byte  Receives it; untouched unless Complete.
    /// @param timeout  From the end of the request's last character; 0 and below only look.
    Transfer receiveByte(std::uint8_t& byte, Milliseconds timeout);
    /// Reads until the frame's end, until the buffer is full or `timeout` has passed since the
    /// call, whichever is first. Silence counts from the call and from every piece that arrives;
    /// arriving bytes never move the deadline.
    FrameEnd receiveFrame(std::span<std::uint8_t> buffer, Milliseconds timeout, Milliseconds gap);
    void purge();

    /// Null without rules.
    const OwedCounts* counts() const { return book_ ? &book_->counts() : nullptr; }

  private:
    struct Pace {
        int baud = 9600;
        int characterBits = 11;
    };

    Pace pace();
    void dropOldInput();
    void dropInput(std::size_t count);

    Milliseconds longestWait() const;
    void keepSilence(ByteView request, const Pace& pace);

    Transfer lookForByte(std::uint8_t& byte);
    Transfer untilFrameEnd(std::size_t most, TimePoint deadline, TimePoint silentAt);
    Transfer awaitRest(TimePoint until, std::size_t missing);
    std::size_t missing() const;
    bool endsByLength() const;

    ByteView front() const;
    bool frontIsForLatest();
    void bookStrays();
    void closeFrame();
    std::size_t takeRestOfCutReply();
    void reportLate();

    Line& line_;
    const ExchangeOptions options_;
    std::optional<OwedReplies> book_;
    LineInput input_;
    std::size_t delivered_ = 0;  // Of the input's first bytes, handed out already.
    std::size_t whole_ = 0;      // So many of the input's first bytes are a frame, booked; or 0.
    Milliseconds gap_{20};       // Of the last receiveFrame().
    TimePoint onWireAt_{};       // When the request's last character is on the wire.
    std::chrono::nanoseconds character_{0};
    bool refused_ = false;

    CutReply cut_;
    bool cutReported_ = false;

    std::atomic<bool> inputIsOld_ = false;
    std::mutex paceMutex_;
    Pace pace_;  // Guarded by paceMutex_.
};

}  // namespace runtime
