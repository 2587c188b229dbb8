// A panel: the driver in this process, on a port over a line of the test's.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"
#include "plugin/ProtModule.h"
#include "runtime/LineExchange.h"
#include "tests/support/FakeHost.h"

namespace slow {

/// The port as the driver sees it; all that it knows stands in the exchange.
class ExchangePort final : public ISerialPort {
  public:
    ExchangePort(runtime::Line& line, runtime::ExchangeOptions options, int baud,
                 int characterBits);
    virtual ~ExchangePort() = default;

    const runtime::LineExchange& exchange() const { return exchange_; }

    int configure(int, int, int, int, int) override { return 1; }
    void purge() override { exchange_.purge(); }
    int receiveByte(unsigned char* byte, int timeoutMs, int) override;
    int send(const unsigned char* data, int length) override;
    int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs, int* received,
                     int) override;

  private:
    runtime::LineExchange exchange_;
};

/// An area whose items are read and written by their offset, which counts from 0.
enum class Items : std::uint8_t { Coils, Inputs, Holding, Registers, Longs };

using Values = std::vector<std::uint32_t>;

/// Nothing is retried here but what the driver retries.
class Panel {
  public:
    /// @param items  The configuration behind the line's settings.
    /// Errors: std::runtime_error when the driver refuses it.
    Panel(ISerialPort& port, const std::string& items);
    ~Panel();
    Panel(const Panel&) = delete;
    Panel& operator=(const Panel&) = delete;

    /// @return one value for each item; nothing when the driver reports an error.
    std::optional<Values> read(int node, Items area, int offset, int count);
    /// @return whether the driver reports success.
    bool write(int node, Items area, int offset, const Values& values);
    std::string lastError() const { return driver_->GetLastErrorString(); }

  private:
    const Tag_MRTU* tag(int node, Items area);

    testing_support::FakeHost host_;
    ProtModule module_;
    std::unique_ptr<Protocol_MRTU> driver_;
    std::map<std::pair<int, Items>, const Tag_MRTU*> tags_;
};

}  // namespace slow
