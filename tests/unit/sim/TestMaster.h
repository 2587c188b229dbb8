// The other end of the simulated line: a few system calls, independent of the code under test.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace sim {

/// Every wait gives up after ten seconds, so that a failure ends the test instead of hanging it.
class TestMaster {
  public:
    explicit TestMaster(const std::string& path);
    ~TestMaster();
    TestMaster(const TestMaster&) = delete;
    TestMaster& operator=(const TestMaster&) = delete;

    bool isOpen() const { return fd_ >= 0; }
    void send(const std::vector<std::uint8_t>& bytes);
    void send(const std::string& text);

    /// Writes zeroes until the port takes no more or `limit` are written. @return how many.
    std::size_t sendUntilFull(std::size_t limit);

    /// @return what has arrived when `count` bytes are there, the line has gone or time is up.
    std::vector<std::uint8_t> receive(std::size_t count);
    std::string receiveText(std::size_t count);

    /// @return whether the line went away, with the end of file or EIO.
    bool seesHangUp();

  private:
    bool waitForInput(std::int64_t deadlineMs) const;

    int fd_;
};

}  // namespace sim
