// A serial port with simulated slaves behind it that takes no time: requests are answered where
// they are sent.
#pragma once

#include <algorithm>
#include <cstring>
#include <string>

#include "platform/ISerialFactory.h"
#include "sim/Slave.h"
#include "wire/Framing.h"

namespace poll_test {

/// The port and the service that opens it, one line of RTU frames. One thread.
class SlavePort final : public ISerialPort, public ISerialFactory {
  public:
    explicit SlavePort(sim::Slave& slave) : slave_(slave) {}
    virtual ~SlavePort() = default;

    int requests() const { return requests_; }
    /// From now on no request is answered.
    void fallSilent(bool silent = true) { silent_ = silent; }

    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this)
                                                        : nullptr;
    }
    const char* GetImpName() const override { return "SlavePort"; }
    int GetImpVersion() const override { return 1; }
    ISerialPort* openPort(const char*) override { return this; }
    void releasePort(ISerialPort*) override {}

    int configure(int, int, int, int, int) override { return 1; }
    void purge() override { next_ = reply_.size(); }
    int send(const unsigned char* data, int length) override {
        ++requests_;
        reply_.clear();
        next_ = 0;
        wire::MessageRoom room;
        const wire::ByteView frame(data, static_cast<std::size_t>(length));
        const auto answer = slave_.answer(wire::messageIn(wire::Mode::Rtu, frame, room));
        if (answer && !silent_) reply_ = wire::encodeFrame(wire::Mode::Rtu, *answer);
        return 1;
    }
    int receiveByte(unsigned char* byte, int, int) override {
        if (next_ >= reply_.size()) return 0;
        *byte = reply_[next_++];
        return 1;
    }
    int receiveFrame(unsigned char* data, int maxLength, int, int, int* received, int) override {
        const std::size_t count =
            std::min(reply_.size() - next_, static_cast<std::size_t>(maxLength));
        std::memcpy(data, reply_.data() + next_, count);
        next_ += count;
        *received = static_cast<int>(count);
        return count > 0 ? 1 : 0;
    }

  private:
    sim::Slave& slave_;
    wire::Bytes reply_;
    std::size_t next_ = 0;
    int requests_ = 0;
    bool silent_ = false;
};

}  // namespace poll_test
