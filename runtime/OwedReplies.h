// Which replies are still to come, so that none is taken for the reply to another request.
//
// A request that is repeated leaves the reply to its first attempt owed; when it comes late it
// looks like the reply to whatever was asked next. This book knows what was sent and what came
// back. Pure: no line, no clock; the moments are passed in.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <vector>

#include "runtime/NodeHistory.h"
#include "runtime/ReplyRules.h"

namespace runtime {

/// Whether a request may leave.
struct Departure {
    enum class Kind : std::uint8_t {
        Now,
        Later,  ///< Not before the line has been silent until `when`; then ask again.
        Not,    ///< Its reply could not be told from others', for longer than anybody should wait:
                ///< unless that has changed at `when`, no later than an answer would be waited for.
    };
    Kind kind = Kind::Now;
    Line::TimePoint when{};
};

/// What happened to a node's replies, for people. Times are in nanoseconds.
struct LateNode {
    std::uint8_t node;
    NodeHistory::Duration turnaround;  ///< The largest that is certain.
    NodeHistory::Duration timeout;     ///< In force when it was asked.
};

/// What the book has counted since it was opened.
struct OwedCounts {
    std::uint64_t late = 0;       ///< Replies that came too late and were thrown away.
    std::uint64_t surplus = 0;    ///< Replies that nobody had asked for.
    std::uint64_t forgotten = 0;  ///< Replies given up, since they can no longer come.
    std::uint64_t overflown = 0;  ///< Requests forgotten because too many were unanswered.
};

/// Rules of the book:
/// - A request equal to the one before it, which was not answered, is a repetition: it never waits,
///   and the reply to any of its attempts is its reply.
/// - Another request for which an owed reply could be taken waits until what its node owes has
///   come or can no longer come (NodeHistory::patience()).
/// - A node that was never heard, or for which somebody has waited in vain since, is not waited
///   for; it costs the others nothing. What it owes is remembered all the same.
/// - A received frame that could answer an older request is thrown away, also when it could answer
///   the latest one, too: then the older one counts as answered.
/// Threads: one at a time. No heap memory after the construction.
class OwedReplies {
  public:
    using TimePoint = Line::TimePoint;
    using Duration = NodeHistory::Duration;

    /// Unanswered requests that are remembered; beyond it the oldest is forgotten.
    static constexpr std::size_t kMostRequests = 128;
    /// A node that has sent a reply twice is believed not to do so any more after so many silences
    /// in a row in which nothing came.
    static constexpr unsigned kSilencesOfTrust = 16;
    /// Longer requests are not followed. The longest of serial Modbus has 513 characters.
    static constexpr std::size_t kLongestRequest = 520;

    /// @param rules  Must outlive the book.
    explicit OwedReplies(const ReplyRules& rules);

    Departure before(ByteView request, TimePoint now);
    void sent(ByteView request, TimePoint now);
    /// Somebody waits for the reply to the latest request.
    void awaits(Duration timeout);

    /// The latest request; empty before the first one.
    ByteView latest() const { return latest_.frame(); }
    /// Whether a frame may be owed to a request other than the first attempt of the latest, so
    /// that it must be seen whole before anybody gets a byte of it.
    bool mustSeeWhole() const;

    /// Whether anything may still come that the book wants to see.
    bool expectsAny() const { return latest_.owed > 0 || mustSeeWhole(); }

    enum class Verdict : std::uint8_t { Deliver, ThrowAway };
    /// Books a frame that has come while the latest request waits.
    Verdict arrived(ByteView frame, TimePoint now);
    /// Books a frame that has come while nobody waits.
    void arrivedLate(ByteView frame, TimePoint now);

    /// @return the bytes at the front of `received` that are a whole frame for one of the owed;
    /// 0 when they begin with none.
    std::size_t frontFrame(ByteView received) const;
    /// Whether `received` is such frames from end to end, or empty.
    bool areFrames(ByteView received) const;

    /// @return a node whose late replies nobody was told of; each node once, when all that it owed
    /// has come or been given up.
    std::optional<LateNode> takeLateNode();
    const OwedCounts& counts() const { return counts_; }

  private:
    class Request {
      public:
        void start(ByteView frame, std::uint8_t addressee, TimePoint now);
        ByteView frame() const { return {bytes_.data(), length_}; }

        std::uint8_t node = 0;
        unsigned owed = 0;  ///< Replies to come.
        TimePoint first{};  ///< The first attempt that may be unanswered.
        TimePoint last{};

      private:
        std::array<std::uint8_t, kLongestRequest> bytes_{};
        std::size_t length_ = 0;
    };
    struct Node {
        NodeHistory history;
        bool awaited = false;    // Others wait for its replies.
        bool returning = false;  // Heard for the first time, with a reply to who knows what.
        unsigned repeats = 0;    // Has sent a reply twice; silences until that is forgotten.
        bool told = false;
    };

    bool isRepetition(ByteView request) const;
    bool couldMistake(ByteView request, std::uint8_t node) const;
    bool owesNothing(std::uint8_t node) const;
    bool fits(const Request& request, ByteView frame, Answer as) const;
    Request* oldestFor(ByteView frame, Answer as);

    void forgetExpired(TimePoint now);
    void putAside();
    void makeRoom();
    void giveUp(std::uint8_t node);
    void settle(std::uint8_t node);
    void answered(TimePoint now);
    void damaged(TimePoint now);
    void late(Request& request, TimePoint now, bool ambiguous);
    bool surplus(ByteView frame, TimePoint now);
    bool holdsTwo(ByteView frame) const;

    const ReplyRules& rules_;
    Request latest_;    // Owes nothing when nobody answers it.
    Request answered_;  // The last one whose reply was delivered.
    bool latestAnswered_ = true;
    std::vector<Request> older_;  // Each owes at least one reply.
    std::vector<Node> nodes_;     // By addressee.
    std::optional<LateNode> lateNode_;
    OwedCounts counts_;
};

}  // namespace runtime
