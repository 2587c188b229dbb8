// A serial factory that shows every frame that passes through another one.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <span>
#include <string>

#include "platform/ISerialFactory.h"

namespace runtime {

enum class TraceDirection { Sent, Received };

/// One frame that passed. `bytes` and `port` live as long as the call that brings them.
struct TraceEvent {
    TraceDirection direction;
    const std::string& port;                          ///< "com1" ..
    std::chrono::steady_clock::time_point monotonic;  ///< Sent: before sending; received: at its
    std::chrono::system_clock::time_point realTime;   ///< first byte.
    std::span<const std::uint8_t> bytes;
    bool complete;      ///< false for a send that failed and a reply cut short by a vanished port.
    bool late = false;  ///< An older request's reply, which the port threw away.
};

struct TraceCounts {
    std::uint64_t framesSent = 0;
    std::uint64_t framesReceived = 0;
    std::uint64_t bytesSent = 0;
    std::uint64_t bytesReceived = 0;
};

/// Forwards everything to `inner` unchanged. The first byte of a reply and the rest of it, which
/// drivers fetch in two calls, are shown as one frame; bytes fetched one by one with nothing
/// behind them (late answers thrown away before a request) are shown when the next request, a
/// purge, a fruitless wait or the release ends them.
/// Threads: any; the callback is called by one thread at a time and must not use the factory.
class TracingSerialFactory final : public ISerialFactory {
  public:
    using Callback = std::function<void(const TraceEvent&)>;

    /// @param inner  Must outlive this object and the ports opened through it.
    /// @param callback  Empty to count only.
    TracingSerialFactory(ISerialFactory& inner, Callback callback);
    /// Releases what is still open.
    ~TracingSerialFactory() override;
    TracingSerialFactory(const TracingSerialFactory&) = delete;
    TracingSerialFactory& operator=(const TracingSerialFactory&) = delete;

    ISerialPort* openPort(const char* name) override;
    /// Null and ports of others are ignored.
    void releasePort(ISerialPort* port) override;

    TraceCounts counts() const;

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "runtime::TracingSerialFactory"; }
    int GetImpVersion() const override { return 100; }

  private:
    class TracingPort;
    void report(const TraceEvent& event);

    ISerialFactory& inner_;
    Callback callback_;
    mutable std::mutex reportMutex_;
    TraceCounts counts_;
    std::mutex portsMutex_;
    std::map<ISerialPort*, std::unique_ptr<TracingPort>> ports_;
};

}  // namespace runtime
