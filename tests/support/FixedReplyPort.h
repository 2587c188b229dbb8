// A serial port that gives one reply for ever and never touches the heap.
#pragma once

#include <algorithm>
#include <array>
#include <cstring>

#include "platform/ISerialFactory.h"
#include "tests/support/ByteTexts.h"

namespace testing_support {

/// For tests that count allocations and for benchmarks; it records only the last request.
/// One thread.
class FixedReplyPort final : public ISerialPort {
  public:
    explicit FixedReplyPort(const Bytes& reply) { setReply(reply); }
    virtual ~FixedReplyPort() = default;

    /// REQUIRES: at most 513 bytes.
    void setReply(const Bytes& reply) {
        length_ = reply.size();
        std::copy(reply.begin(), reply.end(), reply_.begin());
    }

    int requests() const { return requests_; }
    Bytes lastRequest() const { return {request_.begin(), request_.begin() + requestLength_}; }

    int configure(int, int, int, int, int) override { return 1; }
    void purge() override {}

    int receiveByte(unsigned char* byte, int timeoutMs, int) override {
        if (timeoutMs == 0 || next_ >= length_) return 0;
        *byte = reply_[next_++];
        return 1;
    }

    int send(const unsigned char* data, int length) override {
        requestLength_ = std::min(length, static_cast<int>(request_.size()));
        std::memcpy(request_.data(), data, static_cast<std::size_t>(requestLength_));
        ++requests_;
        next_ = 0;
        return 1;
    }

    int receiveFrame(unsigned char* data, int maxLength, int, int, int* received, int) override {
        const std::size_t count = std::min(length_ - next_, static_cast<std::size_t>(maxLength));
        std::memcpy(data, reply_.data() + next_, count);
        next_ += count;
        *received = static_cast<int>(count);
        return count > 0 ? 1 : 0;
    }

  private:
    std::array<unsigned char, 513> reply_{};
    std::array<unsigned char, 513> request_{};
    std::size_t length_ = 0;
    std::size_t next_ = 0;
    int requestLength_ = 0;
    int requests_ = 0;
};

}  // namespace testing_support
