// The serial port service on POSIX terminals.
#pragma once

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "platform/ISerialFactory.h"
#include "runtime/LineExchange.h"

namespace runtime {

class PosixSerialPort;

/// What openPort() and configure() last complained about, and whether a port has vanished; shared
/// by a factory and its ports, so that a port that outlives its factory's interest still has where
/// to write. Threads: any.
class SerialErrors {
  public:
    void set(const std::string& text);
    std::string get() const;
    void notePortGone() { portGone_ = true; }
    /// A port was opened: nothing to complain of, nothing gone.
    void forget() {
        set({});
        portGone_ = false;
    }
    bool portGone() const { return portGone_; }

  private:
    mutable std::mutex mutex_;
    std::string text_;
    std::atomic<bool> portGone_ = false;
};

/// Opens the ports "com1" to "com16", which a map ties to device files.
///
/// A port is opened exclusively: a second open of its device through this or any other factory,
/// in this or any other process of ours, fails, also for root. Settings found at the opening are
/// put back at the release.
/// Threads: any.
class PosixSerialFactory final : public ISerialFactory {
  public:
    static constexpr int kPorts = 16;

    /// Starts with an empty map: no port exists until mapPort() names its device. Guessing device
    /// files could drive a line that somebody else relies on.
    PosixSerialFactory();
    /// Releases what is still open.
    ~PosixSerialFactory() override;
    PosixSerialFactory(const PosixSerialFactory&) = delete;
    PosixSerialFactory& operator=(const PosixSerialFactory&) = delete;

    /// Ties a port name to a device file, e.g. "com1" to "/dev/ttyUSB0"; an empty device unties it.
    /// Open ports are not touched.
    /// @return false, with lastError() set, when the name is none of "com1" .. "com16".
    bool mapPort(const std::string& name, const std::string& device);
    /// @return the device file, empty when the name is not mapped.
    std::string deviceOf(const std::string& name) const;

    /// The shortest silence, in ms, that ends a received frame on ports opened from now on,
    /// whatever shorter gap a driver asks for. 0 (the default) leaves the driver's gap alone.
    /// USB adapters hand over what they receive in chunks, with pauses that the line did not have.
    void setGapFloor(int ms);

    /// The longest wait, in ms, for the first byte of a reply, whatever longer one a driver asks
    /// for; counts at once, also on ports that are open. 0 (the default) leaves the driver's wait
    /// alone. For a look at whether a device is back.
    void limitWait(int ms) { *longestWait_ = ms; }

    // For ports opened from now on, see ExchangeOptions.
    void setFrameEnd(FrameEndBy frameEnd);
    /// @param rules  Null (the default): the ports know nothing of what passes.
    void setReplyRules(std::shared_ptr<const ReplyRules> rules);
    /// @param report  Must be safe to call on every thread that uses a port.
    void setReport(std::function<void(const std::string&)> report);
    /// @param thrownAway  Gets the port's name and the frame; as `report`.
    void setThrownAway(std::function<void(const std::string&, ByteView)> thrownAway);

    ISerialPort* openPort(const char* name) override;
    /// Null and ports of others are ignored.
    void releasePort(ISerialPort* port) override;

    /// Ports open at this moment.
    int openPorts() const;
    /// @return why the last openPort() or configure() failed, e.g.
    /// "com1: /dev/ttyUSB9: No such file or directory"; empty after one that succeeded.
    std::string lastError() const;
    /// Whether a port vanished (end of file, I/O error, hang-up) while it was open, and none was
    /// opened since. The interface tells a vanished port from a silent one nowhere else.
    bool portGone() const { return errors_->portGone(); }

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "runtime::PosixSerialFactory"; }
    int GetImpVersion() const override { return 100; }

  private:
    ExchangeOptions exchangeOf(const std::string& port) const;

    mutable std::mutex mutex_;
    std::map<std::string, std::string> devices_;
    std::map<ISerialPort*, std::unique_ptr<PosixSerialPort>> open_;
    std::shared_ptr<SerialErrors> errors_;
    const std::shared_ptr<std::atomic<int>> longestWait_ = std::make_shared<std::atomic<int>>(0);
    ExchangeOptions exchange_;
    std::function<void(const std::string&, ByteView)> thrownAway_;
};

/// True for "com1" .. "com16", exactly so written.
bool isPortName(const std::string& name);

}  // namespace runtime
