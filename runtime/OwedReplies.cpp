#include "runtime/OwedReplies.h"

#include <algorithm>
#include <utility>

namespace runtime {
namespace {

constexpr std::size_t kAddressees = 256;

bool equal(ByteView one, ByteView other) {
    return std::equal(one.begin(), one.end(), other.begin(), other.end());
}

}  // namespace

void OwedReplies::Request::start(ByteView frame, std::uint8_t addressee, TimePoint now) {
    node = addressee;
    owed = 0;
    first = now;
    last = now;
    length_ = frame.size();
    std::copy(frame.begin(), frame.end(), bytes_.begin());
}

OwedReplies::OwedReplies(const ReplyRules& rules) : rules_(rules), nodes_(kAddressees) {
    older_.reserve(kMostRequests);
}

Departure OwedReplies::before(ByteView request, TimePoint now) {
    forgetExpired(now);
    const auto addressee = rules_.addressee(request);
    if (!addressee) return {};
    const Node& node = nodes_[*addressee];
    if (!isRepetition(request) && !couldMistake(request, *addressee)) return {};
    const TimePoint silentAt = node.history.silentAt();
    if (node.returning && now < silentAt) {
        return {Departure::Kind::Not, std::min(silentAt, now + node.history.timeout())};
    }
    const bool sendsOnce = node.repeats == 0;
    if (sendsOnce && isRepetition(request)) return {};
    if (sendsOnce && !node.awaited && !node.returning) return {};
    if (now < silentAt) return {Departure::Kind::Later, silentAt};
    giveUp(*addressee);
    return {};
}

void OwedReplies::sent(ByteView request, TimePoint now) {
    const bool repeated = isRepetition(request);
    if (!repeated) putAside();
    const auto addressee = rules_.addressee(request);
    const bool isFollowed = addressee && request.size() <= kLongestRequest;
    latestAnswered_ = !isFollowed;
    if (!isFollowed) return latest_.start({}, 0, now);
    if (!repeated || latest_.owed == 0) latest_.start(request, *addressee, now);
    ++latest_.owed;
    latest_.last = now;
    nodes_[*addressee].history.sent(now);
}

void OwedReplies::awaits(Duration timeout) {
    nodes_[latest_.node].history.setTimeout(timeout);
}

bool OwedReplies::mustSeeWhole() const {
    return !older_.empty() || latest_.owed > 1 || nodes_[latest_.node].repeats > 0;
}

OwedReplies::Verdict OwedReplies::arrived(ByteView frame, TimePoint now) {
    const bool forLatest = fits(latest_, frame, Answer::Yes);
    if (Request* const request = oldestFor(frame, Answer::Yes)) {
        late(*request, now, forLatest);
        return Verdict::ThrowAway;
    }
    if (forLatest) {
        answered(now);
        return Verdict::Deliver;
    }
    if (fits(latest_, frame, Answer::Damaged)) {
        damaged(now);
        return Verdict::Deliver;
    }
    if (Request* const request = oldestFor(frame, Answer::Damaged)) {
        late(*request, now, false);
        return Verdict::ThrowAway;
    }
    return surplus(frame, now) ? Verdict::ThrowAway : Verdict::Deliver;
}

void OwedReplies::arrivedLate(ByteView frame, TimePoint now) {
    for (const Answer as : {Answer::Yes, Answer::Damaged}) {
        Request* const request = oldestFor(frame, as);
        const bool forLatest = fits(latest_, frame, as);
        if (request != nullptr) return late(*request, now, forLatest);
        if (forLatest) return late(latest_, now, false);
    }
    surplus(frame, now);
}

std::size_t OwedReplies::frontFrame(ByteView received) const {
    const auto lengthFor = [&](const Request& request) -> std::size_t {
        const std::size_t length = rules_.replyLength(request.frame(), received);
        const bool whole = length > 0 && length <= received.size() &&
                           rules_.answers(request.frame(), received.first(length)) == Answer::Yes;
        return whole ? length : 0;
    };
    for (const Request& request : older_) {
        if (const std::size_t length = lengthFor(request)) return length;
    }
    const std::size_t length = lengthFor(latest_);
    return length > 0 ? length : lengthFor(answered_);
}

bool OwedReplies::areFrames(ByteView received) const {
    while (!received.empty()) {
        const std::size_t length = frontFrame(received);
        if (length == 0) return false;
        received = received.subspan(length);
    }
    return true;
}

std::optional<LateNode> OwedReplies::takeLateNode() {
    return std::exchange(lateNode_, std::nullopt);
}

bool OwedReplies::isRepetition(ByteView request) const {
    return !latestAnswered_ && equal(request, latest_.frame());
}

/// Whether a reply that `node` owes could be taken for the one to this request.
bool OwedReplies::couldMistake(ByteView request, std::uint8_t node) const {
    const auto mistakable = [&](const Request& owing) {
        return owing.node == node && owing.owed > 0 && rules_.confusable(owing.frame(), request);
    };
    return nodes_[node].repeats > 0 || mistakable(latest_) ||
           std::any_of(older_.begin(), older_.end(), mistakable);
}

bool OwedReplies::owesNothing(std::uint8_t node) const {
    return (latest_.node != node || latest_.owed == 0) &&
           std::none_of(older_.begin(), older_.end(),
                        [node](const Request& request) { return request.node == node; });
}

bool OwedReplies::fits(const Request& request, ByteView frame, Answer as) const {
    return request.owed > 0 && rules_.answers(request.frame(), frame) == as;
}

OwedReplies::Request* OwedReplies::oldestFor(ByteView frame, Answer as) {
    Request* oldest = nullptr;
    for (Request& request : older_) {
        const bool older = oldest == nullptr || request.first < oldest->first;
        if (older && fits(request, frame, as)) oldest = &request;
    }
    return oldest;
}

/// What a node that is known to be faster has not answered by now is lost. A node of which nothing
/// is known yet may be very slow.
void OwedReplies::forgetExpired(TimePoint now) {
    const auto expired = [&](const Request& request) {
        const NodeHistory& history = nodes_[request.node].history;
        const Duration memory =
            history.wasHeard() ? history.patience() : NodeHistory::kLongestMemory;
        return now >= std::max(request.last, history.lastHeard()) + memory;
    };
    for (std::size_t i = 0; i < older_.size();) {
        if (!expired(older_[i])) {
            ++i;
            continue;
        }
        const std::uint8_t node = older_[i].node;
        counts_.forgotten += older_[i].owed;
        // Not heard since: it is not there, and nobody waits for it again.
        if (nodes_[node].history.lastHeard() <= older_[i].first) nodes_[node].awaited = false;
        older_.erase(older_.begin() + static_cast<std::ptrdiff_t>(i));
        if (owesNothing(node)) {
            settle(node);
        }
    }
}

/// The latest request is no longer the latest; what it is owed is still to come.
void OwedReplies::putAside() {
    if (latest_.owed == 0) return;
    const auto same = std::find_if(older_.begin(), older_.end(), [this](const Request& request) {
        return equal(request.frame(), latest_.frame());
    });
    if (same != older_.end()) {
        same->owed += latest_.owed;
        same->last = latest_.last;
        return;
    }
    if (older_.size() == kMostRequests) makeRoom();
    older_.push_back(latest_);
}

void OwedReplies::makeRoom() {
    const auto oldest = std::min_element(
        older_.begin(), older_.end(),
        [](const Request& one, const Request& other) { return one.last < other.last; });
    older_.erase(oldest);
    ++counts_.overflown;
}

/// The node was silent for so long that nothing can come any more. When it has answered something
/// since, single frames were lost; else it is not there.
void OwedReplies::giveUp(std::uint8_t number) {
    Node& node = nodes_[number];
    bool answeredSince = true;
    const auto forget = [&](Request& request) {
        if (request.node != number || request.owed == 0) return false;
        counts_.forgotten += request.owed;
        answeredSince = answeredSince && node.history.lastHeard() > request.first;
        request.owed = 0;
        return true;
    };
    older_.erase(std::remove_if(older_.begin(), older_.end(), forget), older_.end());
    forget(latest_);
    node.awaited = answeredSince || node.returning;
    // What a node that was dead seems to have taken is the time that it was dead for. Elsewhere a
    // suspicion costs little, and may be right.
    if (node.returning) node.history.dismiss();
    if (node.repeats > 0) --node.repeats;
    settle(number);
}

/// A node owes nothing any more.
void OwedReplies::settle(std::uint8_t number) {
    Node& node = nodes_[number];
    node.returning = false;
    const NodeHistory& history = node.history;
    if (node.told || history.largest() <= history.timeout()) return;
    node.told = true;
    lateNode_ = LateNode{number, history.largest(), history.timeout()};
}

void OwedReplies::answered(TimePoint now) {
    Node& node = nodes_[latest_.node];
    const Duration since = now - std::max(latest_.last, node.history.lastHeard());
    const Duration sinceFirst = now - std::max(latest_.first, node.history.lastHeard());
    node.history.heard(now, since, sinceFirst);
    node.awaited = true;
    node.returning = false;
    --latest_.owed;
    latestAnswered_ = true;
    answered_ = latest_;
    if (!owesNothing(latest_.node)) return;
    node.history.confirm();
    settle(latest_.node);
}

/// A reply that the line has spoilt is a reply that came; the driver asks again.
void OwedReplies::damaged(TimePoint now) {
    Node& node = nodes_[latest_.node];
    node.history.heard(now, Duration{0}, Duration{0});
    node.awaited = true;
    --latest_.owed;
}

/// @param ambiguous  It may as well be the reply to the latest request, so that it tells nothing
/// certain of the node's pace.
void OwedReplies::late(Request& request, TimePoint now, bool ambiguous) {
    const std::uint8_t number = request.node;
    Node& node = nodes_[number];
    const TimePoint heardBefore = node.history.lastHeard();
    const Duration since = now - std::max(request.last, heardBefore);
    const Duration sinceFirst = now - std::max(request.first, heardBefore);
    if (!node.history.wasHeard()) node.returning = ambiguous;
    node.history.heard(now, ambiguous ? Duration{0} : since, sinceFirst);
    node.awaited = true;
    ++counts_.late;
    --request.owed;
    older_.erase(std::remove_if(older_.begin(), older_.end(),
                                [](const Request& each) { return each.owed == 0; }),
                 older_.end());
    if (!owesNothing(number)) return;
    node.history.confirm();
    settle(number);
}

/// A reply that was delivered comes once more: from now on each reply of that node may.
bool OwedReplies::surplus(ByteView frame, TimePoint now) {
    const bool repeated = rules_.answers(answered_.frame(), frame) == Answer::Yes;
    if (!repeated && !holdsTwo(frame)) return false;
    Node& node = nodes_[answered_.node];
    node.history.heard(now, Duration{0}, Duration{0});
    node.repeats = kSilencesOfTrust;
    ++counts_.surplus;
    return repeated;
}

/// Whether two replies came without a pause, one of them asked for.
bool OwedReplies::holdsTwo(ByteView frame) const {
    const std::size_t front = frontFrame(frame);
    return front > 0 && front < frame.size() && frontFrame(frame.subspan(front)) > 0;
}

}  // namespace runtime
