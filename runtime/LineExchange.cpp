#include "runtime/LineExchange.h"

#include <algorithm>
#include <utility>

#include "runtime/PortAdvice.h"

namespace runtime {
namespace {

using std::chrono::nanoseconds;

Milliseconds notNegative(Milliseconds time) {
    return std::max(time, Milliseconds{0});
}

}  // namespace

LineExchange::LineExchange(Line& line, ExchangeOptions options)
    : line_(line), options_(std::move(options)), input_(line) {
    if (options_.rules) book_.emplace(*options_.rules);
}

void LineExchange::setFormat(int baud, int characterBits) {
    const std::lock_guard guard(paceMutex_);
    pace_ = {baud, characterBits};
}

LineExchange::Pace LineExchange::pace() {
    const std::lock_guard guard(paceMutex_);
    return pace_;
}

void LineExchange::purge() {
    line_.discardInput();
    dropInput(input_.bytes().size());
}

void LineExchange::dropOldInput() {
    if (inputIsOld_.exchange(false)) dropInput(input_.bytes().size());
}

void LineExchange::dropInput(std::size_t count) {
    input_.drop(count);
    delivered_ = 0;
    whole_ = 0;
}

bool LineExchange::clearToSend(ByteView request) {
    // Who was refused a moment ago has waited for long enough.
    const bool waitedBefore = std::exchange(refused_, false);
    dropOldInput();
    if (!book_) {
        dropInput(delivered_);
        return true;
    }
    bookStrays();
    const TimePoint giveUpAt = line_.now() + (waitedBefore ? nanoseconds{0} : kLongestWait);
    for (;;) {
        const TimePoint now = line_.now();
        const Departure departure = book_->before(request, now);
        reportLate();
        if (departure.kind == Departure::Kind::Now) return true;
        const bool last = departure.kind == Departure::Kind::Not || now >= giveUpAt;
        const Transfer came =
            waitedBefore && last ? input_.look() : input_.await(std::min(departure.when, giveUpAt));
        if (came == Transfer::Gone) return true;  // The sending will find it out.
        bookStrays();
        if (last) break;
    }
    refused_ = book_->before(request, line_.now()).kind != Departure::Kind::Now;
    return !refused_;
}

Transfer LineExchange::transmit(ByteView request, bool untilSent) {
    const Pace format = pace();
    character_ = characterTime(format.baud, format.characterBits);
    keepSilence(request, format);
    const TimePoint now = line_.now();
    const TimePoint deadline = now + sendingTime(request.size(), character_);
    onWireAt_ = std::max(now, onWireAt_) + character_ * static_cast<std::int64_t>(request.size());
    if (book_) book_->sent(request, now);
    const Transfer how = sendAll(line_, request, deadline);
    if (how != Transfer::Complete || !untilSent) return how;
    return drain(line_, deadline, character_);
}

void LineExchange::keepSilence(ByteView request, const Pace& format) {
    if (!options_.rules) return;
    const TimePoint silentEnough =
        input_.lastArrival() + options_.rules->silence(request, format.baud, format.characterBits);
    if (line_.now() < silentEnough) line_.sleepUntil(silentEnough);
}

Milliseconds LineExchange::longestWait() const {
    const int limit = options_.longestWait ? options_.longestWait->load() : 0;
    return limit > 0 ? Milliseconds{limit} : Milliseconds::max();
}

Transfer LineExchange::receiveByte(std::uint8_t& byte, Milliseconds timeout) {
    dropOldInput();
    if (timeout <= Milliseconds{0}) return lookForByte(byte);
    if (refused_) return Transfer::TimedOut;
    timeout = std::min(timeout, longestWait());
    if (book_) book_->awaits(timeout);
    const TimePoint deadline = std::max(line_.now(), onWireAt_) + timeout;
    for (;;) {
        if (delivered_ == input_.bytes().size()) {
            if (input_.isFull()) closeFrame();
            const Transfer came = input_.await(deadline);
            if (came != Transfer::Complete) return came;
        }
        if (delivered_ > 0 || !book_ || !book_->mustSeeWhole()) break;
        untilFrameEnd(LineInput::kRoom, line_.now() + timeout, input_.lastArrival() + gap_);
        if (frontIsForLatest()) break;
        if (line_.now() >= deadline) return Transfer::TimedOut;
    }
    byte = input_.bytes()[delivered_++];
    return Transfer::Complete;
}

Transfer LineExchange::lookForByte(std::uint8_t& byte) {
    if (delivered_ == input_.bytes().size()) {
        if (input_.isFull()) closeFrame();
        const Transfer came = input_.look();
        if (came != Transfer::Complete) return came;
    }
    byte = input_.bytes()[delivered_++];
    return Transfer::Complete;
}

FrameEnd LineExchange::receiveFrame(std::span<std::uint8_t> buffer, Milliseconds timeout,
                                    Milliseconds gap) {
    dropOldInput();
    gap_ = notNegative(std::max(gap, options_.gapFloor));
    const TimePoint now = line_.now();
    const std::size_t most = std::min(LineInput::kRoom, delivered_ + buffer.size());
    const Transfer how = whole_ > 0 ? Transfer::Complete
                                    : untilFrameEnd(most, now + notNegative(timeout), now + gap_);
    const std::size_t end = whole_ > 0 ? whole_ : input_.bytes().size();
    const ByteView rest = input_.bytes().first(end).subspan(std::min(end, delivered_));
    const std::size_t count = std::min(buffer.size(), rest.size());
    std::copy_n(rest.begin(), count, buffer.begin());
    delivered_ += count;
    closeFrame();
    return {how, count};
}

/// Takes in bytes until the frame that they begin is at its end.
Transfer LineExchange::untilFrameEnd(std::size_t most, TimePoint deadline, TimePoint silentAt) {
    while (input_.bytes().size() < most) {
        if (endsByLength()) return Transfer::Complete;
        const std::size_t rest = missing();
        const bool known = rest > 0 && options_.frameEnd == FrameEndBy::Length;
        const TimePoint until = known ? deadline : std::min(deadline, silentAt);
        const Transfer came = awaitRest(until, rest);
        if (came == Transfer::Gone) return came;
        const bool outOfTime = known || deadline < silentAt;
        if (came == Transfer::TimedOut) return outOfTime ? came : Transfer::Complete;
        if (input_.lastArrival() >= deadline) return Transfer::TimedOut;
        silentAt = input_.lastArrival() + gap_;
    }
    return Transfer::Complete;
}

/// Sleeps until the bytes that are missing can be there, instead of waking for each of them.
Transfer LineExchange::awaitRest(TimePoint until, std::size_t missing) {
    constexpr nanoseconds kWorthIt = std::chrono::microseconds{200};
    const TimePoint there = input_.lastArrival() + character_ * static_cast<std::int64_t>(missing);
    if (missing > 1 && there - line_.now() > kWorthIt) {
        line_.sleepUntil(std::min(until, there));
        const Transfer came = input_.look();
        if (came != Transfer::TimedOut) return came;
    }
    return input_.await(until);
}

/// Bytes that the reply to the latest request lacks; 0 when that can't be told.
std::size_t LineExchange::missing() const {
    if (!book_) return 0;
    const std::size_t length = options_.rules->replyLength(book_->latest(), input_.bytes());
    return length - std::min(length, input_.bytes().size());
}

bool LineExchange::endsByLength() const {
    if (!book_ || options_.frameEnd != FrameEndBy::Length) return false;
    if (options_.rules->isWhole(book_->latest(), input_.bytes())) return true;
    return book_->mustSeeWhole() && book_->frontFrame(input_.bytes()) > 0;
}

/// The frame that the input begins with. Where silence ends frames, what it has ended is one frame
/// unless it is replies from end to end: an echo, too, may begin with a valid reply.
ByteView LineExchange::front() const {
    const ByteView all = input_.bytes();
    const std::size_t known = book_->frontFrame(all);
    if (known == 0) return all;
    const bool split =
        options_.frameEnd == FrameEndBy::Length || book_->areFrames(all.subspan(known));
    return split ? all.first(known) : all;
}

/// Books the frame that the input begins with. @return whether it may be handed out; else it is
/// thrown away.
bool LineExchange::frontIsForLatest() {
    const std::size_t rest = takeRestOfCutReply();
    const ByteView frame = rest > 0 ? input_.bytes().first(rest) : front();
    whole_ = frame.size();
    if (rest == 0 && book_->arrived(frame, input_.lastArrival()) == OwedReplies::Verdict::Deliver) {
        return true;
    }
    if (options_.thrownAway) options_.thrownAway(frame);
    dropInput(whole_);
    return false;
}

/// Books what has come while nobody waited, to its end, and throws it away.
void LineExchange::bookStrays() {
    if (book_->expectsAny() && !input_.bytes().empty()) {
        const TimePoint now = line_.now();
        untilFrameEnd(LineInput::kRoom, now + kLongestStray, input_.lastArrival() + gap_);
    }
    while (!input_.bytes().empty()) {
        const std::size_t rest = takeRestOfCutReply();
        const std::size_t known = rest > 0 ? rest : book_->frontFrame(input_.bytes());
        const ByteView frame = known > 0 ? input_.bytes().first(known) : input_.bytes();
        if (rest == 0) book_->arrivedLate(frame, input_.lastArrival());
        if (delivered_ == 0 && options_.thrownAway) options_.thrownAway(frame);
        dropInput(frame.size());
    }
}

/// The driver has what it wanted of a frame.
void LineExchange::closeFrame() {
    const ByteView frame = input_.bytes().first(delivered_);
    if (book_ && !frame.empty() && whole_ == 0 && takeRestOfCutReply() == 0) {
        book_->arrived(frame, input_.lastArrival());
        cut_.keep(frame, options_.rules->replyLength(book_->latest(), frame), input_.lastArrival());
    }
    dropInput(delivered_);
}

/// Books the frame before together with its rest, which a pause has cut off and which the input
/// begins with. @return the rest's bytes; 0 when it is none.
std::size_t LineExchange::takeRestOfCutReply() {
    if (cut_.isEmpty()) return 0;
    const std::size_t lacking = std::min(cut_.lacking(), input_.bytes().size());
    const ByteView joined = cut_.joined(input_.bytes().first(lacking));
    const TimePoint now = input_.lastArrival();
    const bool fits = options_.rules->answers(book_->latest(), joined) == Answer::Yes;
    if (fits) book_->arrivedLate(joined, now);
    if (fits && options_.report && !std::exchange(cutReported_, true)) {
        options_.report(cutAdvice(options_.port, gap_, cut_.pauseUntil(now)));
    }
    cut_.forget();
    return fits ? lacking : 0;
}

void LineExchange::reportLate() {
    const auto late = book_->takeLateNode();
    if (late && options_.report) options_.report(lateAdvice(options_.port, *late));
}

}  // namespace runtime
