#include "sim/Serving.h"

#include <poll.h>
#include <sys/prctl.h>

#include <algorithm>
#include <array>
#include <ctime>
#include <utility>

#include "sim/Functions.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::ByteView;

/// More requests than any master leaves unanswered; the others stay in the line's buffer.
constexpr std::size_t kMaxWaiting = 1000;

/// The kernel joins wake-ups that are less than 50 us apart unless it is told otherwise: half a
/// character at 115,200 baud.
void wakePunctually() {
    // Refused, characters come a little later and together; there is nobody to tell.
    [[maybe_unused]] const int result = ::prctl(PR_SET_TIMERSLACK, 1UL);
}

timespec timespecOf(Nanos time) {
    const auto seconds = std::chrono::floor<std::chrono::seconds>(time);
    return {.tv_sec = static_cast<time_t>(seconds.count()),
            .tv_nsec = static_cast<long>((time - seconds).count())};
}

Bytes exceptionTo(ByteView request, std::uint8_t code) {
    Bytes reply = exceptionReply(request[1], code);
    reply.insert(reply.begin(), request[0]);
    return reply;
}

std::map<std::uint8_t, Turnarounds> turnaroundsOf(const SimulatorOptions& options) {
    std::map<std::uint8_t, Turnarounds> turnarounds;
    for (const NodeOptions& node : options.nodes)
        turnarounds.try_emplace(node.address, node.turnaround, options.seed << 8U | node.address);
    return turnarounds;
}

}  // namespace

Serving::Serving(const SimulatorOptions& options, Slave& slave, FaultQueue& faults, PtyLine& line,
                 int stopEvent, Record record)
    : options_(options),
      slave_(slave),
      faults_(faults),
      line_(line),
      stopEvent_(stopEvent),
      record_(std::move(record)),
      receiver_(
          options.mode, [&slave](ByteView bytes) { return slave.requestLength(bytes); },
          options.rate, std::chrono::milliseconds(options.silenceMs)),
      turnarounds_(turnaroundsOf(options)) {}

End Serving::run() {
    if (options_.rate.baud > 0) wakePunctually();
    while (true) {
        const Wake wake = wait(Clock::now());
        if (wake == Wake::Stop) return End::Stopped;
        if (wake == Wake::Bytes && !hear()) return End::HungUp;
        const Instant now = Clock::now();
        // What was due first is done first: who has spoken is free for what came behind it.
        while (!hungUp_ && (send(now) || receive(now))) {
        }
        if (hungUp_) return End::HungUp;
    }
}

Serving::Wake Serving::wait(Instant now) const {
    // ppoll() passes a negative descriptor over.
    std::array<pollfd, 2> watched{
        pollfd{.fd = stopEvent_, .events = POLLIN, .revents = 0},
        pollfd{.fd = mayRead(now) ? line_.descriptor() : -1, .events = POLLIN, .revents = 0}};
    const Instant due = nextDue(now);
    const timespec left = timespecOf(std::max(due - now, Nanos(0)));
    const int ready =
        ::ppoll(watched.data(), watched.size(), due == kNever ? nullptr : &left, nullptr);
    if (ready <= 0) return Wake::Due;
    return watched[0].revents != 0 ? Wake::Stop : Wake::Bytes;
}

bool Serving::mayRead(Instant now) const {
    return turns_.waiting() < kMaxWaiting && receiver_.hasRoomFrom() <= now;
}

Instant Serving::nextDue(Instant now) const {
    Instant due = receiver_.next();
    if (receiver_.hasRoomFrom() > now) due = std::min(due, receiver_.hasRoomFrom());
    if (departure_) return std::min(due, departure_->next());
    for (const Answer& answer : answers_)
        due = std::min(due, std::max(answer.at, lineFreeFrom_));
    return due;
}

bool Serving::hear() {
    const Bytes bytes = line_.read();
    receiver_.add(bytes, Clock::now());
    return line_.descriptor() >= 0;
}

/// @return whether there may be more to do by `now`.
bool Serving::send(Instant now) {
    if (!departure_) return startSending(now);
    const ByteView due = departure_->take(now);
    if (!due.empty()) line_.write(due);
    const bool finished = departure_->finished(now);
    if (finished) finishSending();
    return finished || !due.empty();
}

bool Serving::startSending(Instant now) {
    const auto first =
        std::min_element(answers_.begin(), answers_.end(),
                         [](const Answer& a, const Answer& b) { return a.at < b.at; });
    if (first == answers_.end() || std::max(first->at, lineFreeFrom_) > now) return false;
    Answer answer = std::move(*first);
    answers_.erase(first);
    answer.at = std::max(answer.at, lineFreeFrom_);
    sendReply(std::move(answer));
    return true;
}

void Serving::sendReply(Answer answer) {
    sender_ = answer.node;
    // Gone in the meantime: it has executed the request and tells nobody.
    if (!slave_.isThere(answer.node, sinceStart(answer.at))) {
        turns_.end(sender_, answer.at);
        return beginRequests();
    }
    // Noted first: who has read the reply finds it in the log.
    if (!answer.transmission.bytes.empty())
        record_(LineEvent::Kind::Reply, answer.transmission.bytes);
    departure_.emplace(std::move(answer.transmission), options_.rate, answer.at);
}

void Serving::finishSending() {
    hungUp_ = departure_->transmission().hangUp;
    lineFreeFrom_ = departure_->end() + silenceBeforeReply(options_.mode, options_.rate);
    turns_.end(sender_, departure_->end());
    departure_.reset();
    beginRequests();
}

/// @return whether there may be more to do by `now`.
bool Serving::receive(Instant now) {
    std::optional<Arrival> arrival = receiver_.take(now);
    if (!arrival) return false;
    wire::Received& frame = arrival->frame;
    const bool damaged = frame.damaged();
    const bool lost =
        !damaged && options_.losesWhileBusy && turns_.busyAt(frame.message[0], arrival->at);
    record_(damaged ? LineEvent::Kind::Damaged
            : lost  ? LineEvent::Kind::Lost
                    : LineEvent::Kind::Request,
            std::move(frame.raw));
    if (damaged || lost) return true;
    turns_.add({.message = std::move(frame.message), .at = arrival->at});
    beginRequests();
    return true;
}

void Serving::beginRequests() {
    while (const auto request = turns_.begin()) {
        respond(*request);
        if (hungUp_) return;
    }
}

void Serving::respond(const Request& request) {
    const std::uint8_t node = request.node();
    const bool heard = slave_.isThere(node, sinceStart(request.at));
    const Fault fault = heard ? faults_.take(node).value_or(Fault{}) : Fault{};
    const auto reply = replyTo(request, fault);
    hungUp_ = fault.silent && fault.hangUp;
    if (!reply) return turns_.end(node, request.at);
    const Nanos turnaround =
        std::max(turnarounds_.at(node).next(), silenceBeforeReply(options_.mode, options_.rate));
    Transmission transmission = transmit(options_.mode, *reply, fault);
    const Instant at = request.at + turnaround + std::chrono::milliseconds(transmission.delayMs);
    answers_.push_back({.node = node, .at = at, .transmission = std::move(transmission)});
}

std::optional<Bytes> Serving::replyTo(const Request& request, const Fault& fault) {
    if (fault.silent) return std::nullopt;
    if (fault.exception != 0) return exceptionTo(request.message, fault.exception);
    return slave_.answer(request.message, sinceStart(request.at));
}

}  // namespace sim
