#include "TestMaster.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>

namespace sim {
namespace {

constexpr std::int64_t kPatienceMs = 10000;

std::int64_t nowMs() {
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    return std::chrono::duration_cast<std::chrono::milliseconds>(now).count();
}

}  // namespace

TestMaster::TestMaster(const std::string& path)
    : fd_(::open(path.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC)) {}

TestMaster::~TestMaster() {
    if (fd_ >= 0) ::close(fd_);
}

void TestMaster::send(const std::vector<std::uint8_t>& bytes) {
    EXPECT_EQ(static_cast<ssize_t>(bytes.size()), ::write(fd_, bytes.data(), bytes.size()));
}

void TestMaster::send(const std::string& text) {
    send(std::vector<std::uint8_t>(text.begin(), text.end()));
}

std::size_t TestMaster::sendUntilFull(std::size_t limit) {
    // Long enough for a reader that still reads to make room.
    constexpr int kPatience = 200;
    const std::vector<std::uint8_t> zeroes(1000, 0);
    std::size_t written = 0;
    pollfd watched{.fd = fd_, .events = POLLOUT, .revents = 0};
    EXPECT_EQ(0, ::fcntl(fd_, F_SETFL, O_RDWR | O_NONBLOCK));
    while (written<limit&& ::poll(&watched, 1, kPatience)> 0) {
        const ssize_t got = ::write(fd_, zeroes.data(), zeroes.size());
        if (got <= 0) break;
        written += static_cast<std::size_t>(got);
    }
    EXPECT_EQ(0, ::fcntl(fd_, F_SETFL, O_RDWR));
    return written;
}

bool TestMaster::waitForInput(std::int64_t deadlineMs) const {
    pollfd watched{.fd = fd_, .events = POLLIN, .revents = 0};
    const auto left = static_cast<int>(std::max<std::int64_t>(0, deadlineMs - nowMs()));
    return ::poll(&watched, 1, left) > 0;
}

std::vector<std::uint8_t> TestMaster::receive(std::size_t count) {
    const std::int64_t deadline = nowMs() + kPatienceMs;
    std::vector<std::uint8_t> all;
    while (all.size() < count && waitForInput(deadline)) {
        std::array<std::uint8_t, 1024> buffer{};
        const ssize_t got = ::read(fd_, buffer.data(), std::min(buffer.size(), count - all.size()));
        if (got <= 0) break;
        all.insert(all.end(), buffer.begin(), buffer.begin() + got);
    }
    return all;
}

std::string TestMaster::receiveText(std::size_t count) {
    const auto bytes = receive(count);
    return {bytes.begin(), bytes.end()};
}

bool TestMaster::seesHangUp() {
    if (!waitForInput(nowMs() + kPatienceMs)) return false;
    std::uint8_t byte = 0;
    const ssize_t got = ::read(fd_, &byte, 1);
    return got == 0 || (got < 0 && errno == EIO);
}

}  // namespace sim
