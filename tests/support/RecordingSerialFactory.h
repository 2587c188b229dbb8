// A serial port service that hands out scripted ports and watches what becomes of them.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/ISerialFactory.h"
#include "tests/support/ScriptedPort.h"

namespace testing_support {

/// The test fails when a port is released that this factory never opened or that is not open any
/// more, when a port is opened twice, and when one is left open at the end.
class RecordingSerialFactory final : public ISerialFactory {
  public:
    RecordingSerialFactory() = default;
    ~RecordingSerialFactory() override;

    /// From now on openPort(name) hands out `port`, which the test owns; other names are refused.
    void offer(const std::string& name, ISerialPort& port) { offered_[name] = &port; }
    void withdraw(const std::string& name) { offered_.erase(name); }

    /// The names that were asked for, refused ones included.
    const std::vector<std::string>& opened() const { return opened_; }
    int released() const { return released_; }
    bool anyOpen() const { return !open_.empty(); }

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "RecordingSerialFactory"; }
    int GetImpVersion() const override { return 8; }
    ISerialPort* openPort(const char* name) override;
    void releasePort(ISerialPort* port) override;

  private:
    std::map<std::string, ISerialPort*> offered_;
    std::set<ISerialPort*> open_;
    std::vector<std::string> opened_;
    int released_ = 0;
};

}  // namespace testing_support
