#include "tests/support/ScriptedPort.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace testing_support {

ScriptedPort::~ScriptedPort() {
    if (!script_.empty()) ADD_FAILURE() << script_.size() << " scripted replies were not asked for";
}

void ScriptedPort::reply(const Bytes& bytes) {
    script_.push_back({Kind::answer, bytes});
}
void ScriptedPort::silence() {
    script_.push_back({Kind::answer, {}});
}
void ScriptedPort::late(const Bytes& bytes) {
    script_.push_back({Kind::late, bytes});
}
void ScriptedPort::failFrame(const Bytes& bytes) {
    script_.push_back({Kind::failedFrame, bytes});
}
void ScriptedPort::failSend() {
    script_.push_back({Kind::failedSend, {}});
}

void ScriptedPort::pushInput(const Bytes& bytes) {
    input_.insert(input_.end(), bytes.begin(), bytes.end());
}

void ScriptedPort::forget() {
    sent_.clear();
    settings_.clear();
    byteWaits_.clear();
    frameWaits_.clear();
    flushed_.clear();
    looks_ = 0;
    purges_ = 0;
}

int ScriptedPort::configure(int baud, int parity, int dataBits, int stopBits, int mode) {
    EXPECT_TRUE(open_) << "configure() of a released port";
    if (configureWatcher_) {
        configureWatcher_();
        EXPECT_TRUE(open_) << "a port was released in the middle of configure()";
    }
    const std::lock_guard guard(mutex_);
    settings_.push_back({baud, parity, dataBits, stopBits, mode});
    return refuseSettings_ ? 0 : 1;
}

void ScriptedPort::purge() {
    police("purge()");
    const std::lock_guard guard(mutex_);
    ++purges_;
    input_.clear();
}

int ScriptedPort::receiveByte(unsigned char* byte, int timeoutMs, int reserved) {
    police("receiveByte()");
    EXPECT_EQ(0, reserved) << "receiveByte()";
    const std::lock_guard guard(mutex_);
    return timeoutMs == 0 ? look(byte) : waitForByte(byte, timeoutMs);
}

int ScriptedPort::look(unsigned char* byte) {
    ++looks_;
    if (!input_.empty()) {
        *byte = input_.front();
        input_.pop_front();
    } else if (noise_) {
        *byte = *noise_;
    } else {
        return 0;
    }
    flushed_.push_back(*byte);
    return 1;
}

int ScriptedPort::waitForByte(unsigned char* byte, int timeoutMs) {
    byteWaits_.push_back(timeoutMs);
    if (input_.empty()) {
        tasks_.advance(timeoutMs);
        input_.insert(input_.end(), lateInput_.begin(), lateInput_.end());
        lateInput_.clear();
        return 0;
    }
    *byte = input_.front();
    input_.pop_front();
    return 1;
}

int ScriptedPort::send(const unsigned char* data, int length) {
    police("send()");
    if (length <= 0) {
        ADD_FAILURE() << "send() of " << length << " bytes";
        return 0;
    }
    const Bytes request(data, data + length);
    if (watcher_) watcher_(request);
    const std::lock_guard guard(mutex_);
    sent_.push_back(request);
    const Entry entry = nextEntry(request);
    frameFails_ = entry.kind == Kind::failedFrame;
    if (entry.kind == Kind::late) {
        lateInput_ = entry.bytes;
    } else {
        pushInput(entry.bytes);
    }
    return entry.kind == Kind::failedSend ? 0 : 1;
}

ScriptedPort::Entry ScriptedPort::nextEntry(const Bytes& request) {
    if (!script_.empty()) {
        Entry entry = script_.front();
        script_.pop_front();
        return entry;
    }
    if (slave_) return {Kind::answer, slave_(request)};
    ADD_FAILURE() << "no reply is scripted for the request " << toHex(request);
    return {Kind::answer, {}};
}

int ScriptedPort::receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                               int* received, int reserved) {
    police("receiveFrame()");
    EXPECT_EQ(0, reserved) << "receiveFrame()";
    const std::lock_guard guard(mutex_);
    frameWaits_.push_back({maxLength, timeoutMs, gapMs});
    const std::size_t count = std::min(input_.size(), static_cast<std::size_t>(maxLength));
    std::copy_n(input_.begin(), count, data);
    input_.erase(input_.begin(), input_.begin() + static_cast<std::ptrdiff_t>(count));
    *received = static_cast<int>(count);
    if (count == 0) tasks_.advance(gapMs);
    return count > 0 && !frameFails_ ? 1 : 0;
}

void ScriptedPort::police(const char* operation) const {
    if (!open_) ADD_FAILURE() << operation << " of a released port";
    if (!tasks_.heldByThisThread()) ADD_FAILURE() << operation << " without the transaction lock";
}

}  // namespace testing_support
