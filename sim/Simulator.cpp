#include "sim/Simulator.h"

#include <poll.h>
#include <sys/eventfd.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <limits>
#include <stdexcept>
#include <system_error>
#include <utility>

#include "sim/Functions.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::ByteView;
using wire::FrameSplitter;
using wire::Received;

constexpr auto kForever = std::chrono::steady_clock::time_point::max();

posix::FileDescriptor openEvent() {
    posix::FileDescriptor event(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK));
    if (!event) throw std::system_error(errno, std::generic_category(), "eventfd");
    return event;
}

/// For poll(): rounded up, so that the deadline has passed when the time is up; -1 for ever.
int millisecondsTo(std::chrono::steady_clock::time_point deadline) {
    if (deadline == kForever) return -1;
    const auto left =
        std::chrono::ceil<std::chrono::milliseconds>(deadline - std::chrono::steady_clock::now());
    return static_cast<int>(std::clamp<std::chrono::milliseconds::rep>(
        left.count(), 0, std::numeric_limits<int>::max()));
}

Bytes exceptionTo(ByteView request, std::uint8_t code) {
    Bytes reply = exceptionReply(request[1], code);
    reply.insert(reply.begin(), request[0]);
    return reply;
}

SimulatorOptions checked(SimulatorOptions options) {
    if (options.silenceMs == 0) throw std::invalid_argument("the silence lasts at least 1 ms");
    return options;
}

}  // namespace

Simulator::Simulator(SimulatorOptions options)
    : options_(checked(std::move(options))), slave_(options_.nodes), stopEvent_(openEvent()) {}

Simulator::~Simulator() {
    stop();
}

void Simulator::start() {
    if (thread_.joinable() && !ended_) return;
    joinServing();
    auto line = std::make_unique<PtyLine>(options_.link);
    rememberPaths(*line);
    line_ = std::move(line);
    ended_ = false;
    hungUp_ = false;
    try {
        thread_ = std::thread([this] { serve(); });
    } catch (...) {
        line_.reset();
        throw;
    }
}

void Simulator::stop() {
    requestStop();
    joinServing();
    forgetStopRequest();
}

void Simulator::requestStop() noexcept {
    const int before = errno;  // A signal handler leaves it as it was.
    const std::uint64_t one = 1;
    // Fails only when the counter is full, and then the request is there already.
    [[maybe_unused]] const ssize_t written = ::write(stopEvent_.get(), &one, sizeof one);
    errno = before;
}

Simulator::End Simulator::wait() {
    joinServing();
    if (hungUp_) return End::HungUp;
    forgetStopRequest();
    return End::Stopped;
}

void Simulator::joinServing() {
    if (thread_.joinable()) thread_.join();
    line_.reset();
}

void Simulator::forgetStopRequest() {
    std::uint64_t requests = 0;
    // Fails when nobody has asked: then there is nothing to forget.
    [[maybe_unused]] const ssize_t count = ::read(stopEvent_.get(), &requests, sizeof requests);
}

void Simulator::rememberPaths(const PtyLine& line) {
    const std::lock_guard lock(mutex_);
    path_ = line.path();
    device_ = line.device();
}

std::string Simulator::path() const {
    const std::lock_guard lock(mutex_);
    return path_;
}

std::string Simulator::device() const {
    const std::lock_guard lock(mutex_);
    return device_;
}

std::vector<LineEvent> Simulator::log() const {
    const std::lock_guard lock(mutex_);
    return {log_.begin(), log_.end()};
}

void Simulator::clearLog() {
    const std::lock_guard lock(mutex_);
    log_.clear();
}

bool Simulator::waitForEvents(std::size_t count, std::chrono::milliseconds timeout) const {
    std::unique_lock lock(mutex_);
    return eventAdded_.wait_until(lock, Clock::now() + timeout,
                                  [&] { return log_.size() >= count; });
}

void Simulator::record(LineEvent::Kind kind, Bytes raw) {
    const LineEvent event{.kind = kind, .raw = std::move(raw), .at = Clock::now()};
    {
        const std::lock_guard lock(mutex_);
        log_.push_back(event);
        while (log_.size() > options_.logLimit)
            log_.pop_front();
    }
    eventAdded_.notify_all();
    if (options_.trace) options_.trace(event);
}

Simulator::Wake Simulator::waitUntil(Clock::time_point deadline, bool bytesToo) const {
    // poll() passes a negative descriptor over.
    std::array<pollfd, 2> watched{
        pollfd{.fd = stopEvent_.get(), .events = POLLIN, .revents = 0},
        pollfd{.fd = bytesToo ? line_->descriptor() : -1, .events = POLLIN, .revents = 0}};
    while (true) {
        const int ready = ::poll(watched.data(), watched.size(), millisecondsTo(deadline));
        if (ready > 0) return watched[0].revents != 0 ? Wake::Stop : Wake::Bytes;
        if (Clock::now() >= deadline) return Wake::Time;
    }
}

void Simulator::serve() {
    FrameSplitter splitter(options_.mode,
                           [this](ByteView bytes) { return slave_.requestLength(bytes); });
    Clock::time_point silence = kForever;
    while (!ended_) {
        const Wake wake = waitUntil(silence, true);
        if (wake == Wake::Stop) ended_ = true;
        if (wake == Wake::Bytes) receive(splitter, silence);
        if (wake == Wake::Time) {
            silence = kForever;
            if (const auto frame = splitter.silence()) handle(*frame);
        }
    }
}

void Simulator::receive(FrameSplitter& splitter, Clock::time_point& silence) {
    const Bytes bytes = line_->read();
    if (line_->descriptor() < 0) return hangUp();
    for (const Received& frame : splitter.add(bytes)) {
        if (!ended_) handle(frame);
    }
    const auto end = Clock::now() + std::chrono::milliseconds(options_.silenceMs);
    silence = splitter.waitsForSilence() ? end : kForever;
}

void Simulator::handle(const Received& frame) {
    record(frame.damaged() ? LineEvent::Kind::Damaged : LineEvent::Kind::Request, frame.raw);
    if (frame.damaged()) return;
    const std::uint8_t node = frame.message[0];
    const Fault fault = slave_.hasNode(node) ? faults_.take(node).value_or(Fault{}) : Fault{};
    if (fault.silent) return fault.hangUp ? hangUp() : void();
    const std::optional<Bytes> reply = fault.exception != 0
                                           ? exceptionTo(frame.message, fault.exception)
                                           : slave_.answer(frame.message);
    if (reply) send(transmit(options_.mode, *reply, fault));
}

void Simulator::send(const Transmission& transmission) {
    if (!pause(transmission.delayMs)) return;
    // Noted first: who has read the reply finds it in the log.
    if (!transmission.bytes.empty()) record(LineEvent::Kind::Reply, transmission.bytes);
    const bool inPieces = transmission.dripBytes != 0;
    if (inPieces) sendPieces(transmission);
    if (!inPieces) line_->write(transmission.bytes);
    if (transmission.hangUp && !ended_) hangUp();
}

void Simulator::sendPieces(const Transmission& transmission) {
    ByteView rest = transmission.bytes;
    while (!rest.empty()) {
        const std::size_t piece = std::min(rest.size(), transmission.dripBytes);
        line_->write(rest.first(piece));
        rest = rest.subspan(piece);
        // Before a hang-up the last piece, too, gets its gap: the master can take it.
        const bool gap = !rest.empty() || transmission.hangUp;
        if (gap && !pause(transmission.dripGapMs)) return;
    }
}

bool Simulator::pause(std::uint32_t ms) {
    if (ms == 0) return true;
    ended_ = waitUntil(Clock::now() + std::chrono::milliseconds(ms), false) == Wake::Stop;
    return !ended_;
}

void Simulator::hangUp() {
    // Marked and noted first: who has seen the line go may start() at once and finds it in the log.
    hungUp_ = true;
    ended_ = true;
    record(LineEvent::Kind::HangUp, {});
    line_->hangUp();
}

}  // namespace sim
