#include "sim/Simulator.h"

#include <sys/eventfd.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <stdexcept>
#include <system_error>
#include <utility>

namespace sim {
namespace {

using wire::Bytes;

posix::FileDescriptor openEvent() {
    posix::FileDescriptor event(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK));
    if (!event) throw std::system_error(errno, std::generic_category(), "eventfd");
    return event;
}

bool hasNegativeTime(const NodeOptions& node) {
    const auto& [least, most, growth] = node.turnaround;
    return std::min({least, most, growth, node.presence.there, node.presence.away}) < Nanos(0);
}

SimulatorOptions checked(SimulatorOptions options) {
    if (options.silenceMs == 0) throw std::invalid_argument("the silence lasts at least 1 ms");
    if (std::any_of(options.nodes.begin(), options.nodes.end(), hasNegativeTime)) {
        throw std::invalid_argument("a time is below 0");
    }
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

void Simulator::serve() {
    Serving serving(options_, slave_, faults_, *line_, stopEvent_.get(),
                    [this](LineEvent::Kind kind, Bytes raw) { record(kind, std::move(raw)); });
    hungUp_ = serving.run() == End::HungUp;
    ended_ = true;
    if (!hungUp_) return;
    // Marked and noted first: who has seen the line go may start() at once and finds it in the log.
    record(LineEvent::Kind::HangUp, {});
    line_->hangUp();
}

}  // namespace sim
