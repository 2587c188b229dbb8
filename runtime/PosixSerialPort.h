// One open serial port on a POSIX terminal.
#pragma once

#include <linux/serial.h>
#include <termios.h>

#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include "platform/ISerialFactory.h"
#include "posix/FileDescriptor.h"
#include "runtime/LastAct.h"
#include "runtime/LineExchange.h"
#include "runtime/PosixLine.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/Result.h"
#include "runtime/SerialSettings.h"

namespace runtime {

/// What a port is opened with.
struct PortRequest {
    std::string device;        ///< "/dev/ttyS0" ..
    ExchangeOptions exchange;  ///< `port` is its name.
};

/// What a terminal was like when it was opened.
struct FoundTerminal {
    int fd;
    termios settings;
    std::optional<serial_rs485> direction;  ///< Nothing for a port without direction control.

    /// Throws away what is still to be sent, puts the settings back and gives the exclusiveness
    /// up. Nothing of it can be reported to anybody, and a port that is gone has nothing to put
    /// back. Async-signal-safe.
    void putBack() const noexcept;
};

/// A terminal that this object alone has open. Its destruction puts back the settings that were
/// found and closes it; so does runLastActs() when a signal ends the process.
class PosixSerialPort final : public ISerialPort {
  public:
    /// Opens a device exclusively and notes its settings.
    /// @param errors  Told what configure() complains about.
    /// @return the port, or why there is none, e.g. "com1: /dev/ttyS9: Permission denied",
    /// "com1: /dev/null: not a terminal", "com1: /dev/ttyS0: in use".
    static Result<std::unique_ptr<PosixSerialPort>, std::string> open(
        const PortRequest& request, std::shared_ptr<SerialErrors> errors);

    ~PosixSerialPort();
    PosixSerialPort(const PosixSerialPort&) = delete;
    PosixSerialPort& operator=(const PosixSerialPort&) = delete;

    /// Also checks that the terminal took the settings over, and starts with empty queues. In the
    /// RS-485 modes the kernel switches the direction where the port has that ability; elsewhere
    /// the port is used as it is, since adapters commonly switch by themselves. Waits for a send()
    /// of another thread, never for one that receives.
    int configure(int baud, int parity, int dataBits, int stopBits, int mode) override;
    void purge() override;
    int receiveByte(unsigned char* byte, int timeoutMs, int reserved) override;
    /// Returns when the port has taken the bytes, in the half duplex modes when they are on the
    /// wire. Fails when that takes a second longer than the characters themselves do; what is left
    /// is thrown away then. Fails also, and sends nothing, when the reply could not be told from
    /// others (LineExchange::clearToSend()).
    int send(const unsigned char* data, int length) override;
    int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs, int* received,
                     int reserved) override;

    /// The open terminal, for questions that the interface does not answer.
    int descriptor() const { return fd_.get(); }

  private:
    PosixSerialPort(PortRequest request, std::shared_ptr<SerialErrors> errors,
                    posix::FileDescriptor fd, const termios& found);
    void awaitSent();
    std::string applyFormat();
    std::string applyDirection();
    bool changeDirection(serial_rs485 wanted);
    bool noted(Transfer end);

    std::string label_;
    std::shared_ptr<SerialErrors> errors_;
    posix::FileDescriptor fd_;
    PosixLine line_;
    LineExchange exchange_;
    const FoundTerminal found_;
    LastAct putBackAtTheEnd_;
    std::optional<serial_rs485> direction_;  ///< In force now.
    bool pseudo_;
    std::mutex sendMutex_;     // Held while a frame is sent, and while the settings change.
    SerialSettings settings_;  // Guarded by sendMutex_.
};

}  // namespace runtime
