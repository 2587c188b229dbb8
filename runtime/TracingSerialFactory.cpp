// Ports that pass everything on and tell of whole frames.
#include "runtime/TracingSerialFactory.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace runtime {

/// Forwards to the port of the inner factory and collects what belongs to one received frame.
class TracingSerialFactory::TracingPort final : public ISerialPort {
  public:
    TracingPort(TracingSerialFactory& owner, ISerialPort& inner, std::string name)
        : owner_(owner), inner_(inner), name_(std::move(name)) {
        received_.reserve(kLongestFrame);
    }
    ~TracingPort() { showReceived(true); }
    TracingPort(const TracingPort&) = delete;
    TracingPort& operator=(const TracingPort&) = delete;

    ISerialPort& inner() const { return inner_; }

    int configure(int baud, int parity, int dataBits, int stopBits, int mode) override {
        return inner_.configure(baud, parity, dataBits, stopBits, mode);
    }
    void purge() override {
        showReceived(true);
        inner_.purge();
    }
    int receiveByte(unsigned char* byte, int timeoutMs, int reserved) override;
    int send(const unsigned char* data, int length) override;
    int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs, int* received,
                     int reserved) override;

  private:
    /// A driver's first byte and the rest behind it: 1 + 512.
    static constexpr std::size_t kLongestFrame = 1 + 512;

    void collect(const unsigned char* data, int count);
    void showReceived(bool complete);

    TracingSerialFactory& owner_;
    ISerialPort& inner_;
    std::string name_;
    std::vector<std::uint8_t> received_;
    std::chrono::steady_clock::time_point firstByte_;
    std::chrono::system_clock::time_point firstByteReal_;
};

int TracingSerialFactory::TracingPort::receiveByte(unsigned char* byte, int timeoutMs,
                                                   int reserved) {
    const int arrived = inner_.receiveByte(byte, timeoutMs, reserved);
    if (arrived != 0) {
        collect(byte, 1);
    } else {
        showReceived(true);
    }
    return arrived;
}

int TracingSerialFactory::TracingPort::send(const unsigned char* data, int length) {
    showReceived(true);
    const auto before = std::chrono::steady_clock::now();
    const auto beforeReal = std::chrono::system_clock::now();
    const int sent = inner_.send(data, length);
    const auto count = static_cast<std::size_t>(std::max(0, length));
    owner_.report({TraceDirection::Sent, name_, before, beforeReal, {data, count}, sent != 0});
    return sent;
}

int TracingSerialFactory::TracingPort::receiveFrame(unsigned char* data, int maxLength,
                                                    int timeoutMs, int gapMs, int* received,
                                                    int reserved) {
    const int good = inner_.receiveFrame(data, maxLength, timeoutMs, gapMs, received, reserved);
    collect(data, *received);
    // A failure without a further byte is a frame of one byte; one with bytes is a lost port.
    showReceived(good != 0 || *received == 0);
    return good;
}

void TracingSerialFactory::TracingPort::collect(const unsigned char* data, int count) {
    if (count <= 0) return;
    if (received_.empty()) {
        firstByte_ = std::chrono::steady_clock::now();
        firstByteReal_ = std::chrono::system_clock::now();
    }
    received_.insert(received_.end(), data, data + count);
}

void TracingSerialFactory::TracingPort::showReceived(bool complete) {
    if (received_.empty()) return;
    owner_.report(
        {TraceDirection::Received, name_, firstByte_, firstByteReal_, received_, complete});
    received_.clear();
}

TracingSerialFactory::TracingSerialFactory(ISerialFactory& inner, Callback callback)
    : inner_(inner), callback_(std::move(callback)) {}

TracingSerialFactory::~TracingSerialFactory() {
    for (auto& [port, traced] : ports_) {
        ISerialPort& held = traced->inner();
        traced.reset();
        inner_.releasePort(&held);
    }
}

ISerialPort* TracingSerialFactory::openPort(const char* name) {
    ISerialPort* opened = inner_.openPort(name);
    if (opened == nullptr) return nullptr;
    auto traced = std::make_unique<TracingPort>(*this, *opened, name != nullptr ? name : "");
    ISerialPort* port = traced.get();
    const std::lock_guard guard(portsMutex_);
    ports_[port] = std::move(traced);
    return port;
}

void TracingSerialFactory::releasePort(ISerialPort* port) {
    std::unique_ptr<TracingPort> traced;
    {
        const std::lock_guard guard(portsMutex_);
        const auto row = ports_.find(port);
        if (row == ports_.end()) return;
        traced = std::move(row->second);
        ports_.erase(row);
    }
    ISerialPort& held = traced->inner();
    traced.reset();
    inner_.releasePort(&held);
}

void TracingSerialFactory::report(const TraceEvent& event) {
    const std::lock_guard guard(reportMutex_);
    const bool sent = event.direction == TraceDirection::Sent;
    (sent ? counts_.framesSent : counts_.framesReceived) += 1;
    (sent ? counts_.bytesSent : counts_.bytesReceived) += event.bytes.size();
    if (callback_) callback_(event);
}

TraceCounts TracingSerialFactory::counts() const {
    const std::lock_guard guard(reportMutex_);
    return counts_;
}

void* TracingSerialFactory::ConvertTo(const char* name) {
    return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this) : nullptr;
}

}  // namespace runtime
