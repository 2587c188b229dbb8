// A serial port that answers from a list and records what was sent.
#pragma once

#include <deque>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "platform/ISerialFactory.h"
#include "tests/support/ByteTexts.h"
#include "tests/support/FakeMultiTask.h"

namespace testing_support {

/// Every send() takes the next entry of the script. The test fails when a request finds the script
/// empty, when entries are left over at the end, and when the caller misbehaves: it talks without
/// holding a lock of `tasks`, sends nothing, or uses the port after its release. Waiting in vain
/// moves the clock of `tasks`.
/// Threads: any number.
class ScriptedPort final : public ISerialPort {
  public:
    struct Settings {
        int baud;
        int parity;
        int dataBits;
        int stopBits;
        int mode;
        bool operator==(const Settings&) const = default;
    };
    struct FrameWait {
        int maxLength;
        int timeoutMs;
        int gapMs;
        bool operator==(const FrameWait&) const = default;
    };
    /// Builds a reply from a request; empty: silence.
    using Slave = std::function<Bytes(const Bytes& request)>;

    explicit ScriptedPort(FakeMultiTask& tasks) : tasks_(tasks) {}
    virtual ~ScriptedPort();
    ScriptedPort(const ScriptedPort&) = delete;
    ScriptedPort& operator=(const ScriptedPort&) = delete;

    // The script, one entry for each request.
    void reply(const Bytes& bytes);
    void silence();
    /// Nothing in time; the bytes lie there when the caller looks next.
    void late(const Bytes& bytes);
    /// The first byte arrives; the rest is stored, but the reading of it fails.
    void failFrame(const Bytes& bytes);
    /// send() itself fails, and nothing is received.
    void failSend();

    /// Answers every request for which the script has no entry.
    void answerWith(Slave slave) { slave_ = std::move(slave); }

    /// Bytes that lie in the input before anybody asked.
    void pushInput(const Bytes& bytes);
    /// The input never runs dry, as on a line with a babbling device.
    void babble(std::uint8_t byte) { noise_ = byte; }
    /// From now on configure() fails.
    void refuseSettings(bool refuse = true) { refuseSettings_ = refuse; }
    /// Called at every send(), before the reply is there.
    void onSend(std::function<void(const Bytes&)> watcher) { watcher_ = std::move(watcher); }
    /// Called in the middle of every configure().
    void onConfigure(std::function<void()> watcher) { configureWatcher_ = std::move(watcher); }

    // What happened.
    std::vector<Bytes> sent() const { return sent_; }
    std::vector<Settings> settings() const { return settings_; }
    /// The time-outs of the waits for a first byte.
    std::vector<int> byteWaits() const { return byteWaits_; }
    std::vector<FrameWait> frameWaits() const { return frameWaits_; }
    /// What was read with time-out 0, and how often somebody looked.
    Bytes flushed() const { return flushed_; }
    int looks() const { return looks_; }
    int purges() const { return purges_; }
    std::size_t scriptLeft() const { return script_.size(); }
    void forget();

    // ISerialPort
    int configure(int baud, int parity, int dataBits, int stopBits, int mode) override;
    void purge() override;
    int receiveByte(unsigned char* byte, int timeoutMs, int reserved) override;
    int send(const unsigned char* data, int length) override;
    int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs, int* received,
                     int reserved) override;

    // For the factory.
    void markOpen() { open_ = true; }
    void markReleased() { open_ = false; }

  private:
    enum class Kind { answer, late, failedFrame, failedSend };
    struct Entry {
        Kind kind;
        Bytes bytes;
    };

    void police(const char* operation) const;
    Entry nextEntry(const Bytes& request);
    int look(unsigned char* byte);
    int waitForByte(unsigned char* byte, int timeoutMs);

    FakeMultiTask& tasks_;
    mutable std::mutex mutex_;
    std::deque<Entry> script_;
    Slave slave_;
    std::function<void(const Bytes&)> watcher_;
    std::function<void()> configureWatcher_;
    std::deque<std::uint8_t> input_;
    Bytes lateInput_;
    std::optional<std::uint8_t> noise_;
    bool frameFails_ = false;
    bool refuseSettings_ = false;
    bool open_ = true;

    std::vector<Bytes> sent_;
    std::vector<Settings> settings_;
    std::vector<int> byteWaits_;
    std::vector<FrameWait> frameWaits_;
    Bytes flushed_;
    int looks_ = 0;
    int purges_ = 0;
};

}  // namespace testing_support
