// The driver as the benchmarks use it: linked in, and started on whatever port they hand it.
#pragma once

#include <memory>
#include <stdexcept>
#include <string>

#include "mrtu/Protocol_MRTU.h"
#include "plugin/ProtModule.h"
#include "tests/support/FakeHost.h"

namespace bench {

/// Hands out one port for ever.
class OnePort final : public ISerialFactory {
  public:
    explicit OnePort(ISerialPort& port) : port_(port) {}
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this)
                                                        : nullptr;
    }
    const char* GetImpName() const override { return "OnePort"; }
    int GetImpVersion() const override { return 1; }
    ISerialPort* openPort(const char*) override { return &port_; }
    void releasePort(ISerialPort*) override {}

  private:
    ISerialPort& port_;
};

inline std::string configuration(const std::string& txMode = "RTU") {
    return "CfgVer=1 defNodeId=1 uart=com1 baudrate=115200 parity=none bits=8 stopbits=1 "
           "mode=RS-232 "
           "txMode=" +
           txMode;
}

/// The driver, started on the serial ports that `serial` offers. Throws std::runtime_error.
class StartedDriver {
  public:
    StartedDriver(ISerialFactory& serial, const std::string& configuration) {
        host_.offer("ISerialFactory", serial);
        if (module_.Init(&host_) == 0) throw std::runtime_error(module_.GetLastError());
        protocol_ = std::make_unique<Protocol_MRTU>();
        if (!protocol_->Config(configuration.c_str()) || !protocol_->Start())
            throw std::runtime_error(protocol_->GetLastErrorString());
    }
    ~StartedDriver() {
        protocol_->Stop();
        protocol_.reset();
        module_.Close();
    }
    StartedDriver(const StartedDriver&) = delete;
    StartedDriver& operator=(const StartedDriver&) = delete;

    Protocol_MRTU& protocol() { return *protocol_; }
    /// @return a tag that the driver owns.
    ITag* tag(const char* uri) {
        ITag* made = protocol_->CreateTag(uri);
        if (made == nullptr) throw std::runtime_error(protocol_->GetLastErrorString());
        return made;
    }

  private:
    testing_support::FakeHost host_;
    ProtModule module_;
    std::unique_ptr<Protocol_MRTU> protocol_;
};

}  // namespace bench
