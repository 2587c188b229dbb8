// A pair of pseudo terminals: the test holds the far end, the code under test opens the near one.
#pragma once

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <termios.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <vector>

#include "posix/FileDescriptor.h"
#include "runtime/PosixSerialFactory.h"

class PseudoTerminal {
  public:
    PseudoTerminal() : far_(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC)) {
        char name[64] = {};
        const bool made = far_ && ::grantpt(far_.get()) == 0 && ::unlockpt(far_.get()) == 0 &&
                          ::ptsname_r(far_.get(), name, sizeof name) == 0;
        if (!made) throw std::runtime_error("no pseudo terminal to be had");
        path_ = name;
        // Without an open near end the kernel would forget its settings at every release.
        watch_ = posix::FileDescriptor(::open(name, O_RDWR | O_NOCTTY | O_CLOEXEC));
    }

    const std::string& path() const { return path_; }
    int far() const { return far_.get(); }
    /// A descriptor of the near end that the code under test knows nothing of.
    int watch() const { return watch_.get(); }
    void hangUp() { far_ = posix::FileDescriptor(); }

    void put(const std::vector<std::uint8_t>& bytes) const {
        ASSERT_EQ(static_cast<ssize_t>(bytes.size()),
                  ::write(far_.get(), bytes.data(), bytes.size()));
    }
    /// Waits up to a minute for each piece: a program that never sends must not hold a test for
    /// ever.
    std::vector<std::uint8_t> take(std::size_t count) const {
        constexpr int kPatienceMs = 60'000;
        std::vector<std::uint8_t> bytes(count);
        std::size_t have = 0;
        while (have < count) {
            pollfd watched{far_.get(), POLLIN, 0};
            if (::poll(&watched, 1, kPatienceMs) <= 0) break;
            const ssize_t got = ::read(far_.get(), bytes.data() + have, count - have);
            if (got <= 0) break;
            have += static_cast<std::size_t>(got);
        }
        bytes.resize(have);
        return bytes;
    }
    termios settings() const {
        termios now{};
        EXPECT_EQ(0, ::tcgetattr(watch_.get(), &now));
        return now;
    }

  private:
    posix::FileDescriptor far_;
    posix::FileDescriptor watch_;
    std::string path_;
};

/// A pseudo terminal mapped to "com1".
struct LineTest : ::testing::Test {
    LineTest() { factory.mapPort("com1", terminal.path()); }

    ISerialPort* openPort() {
        ISerialPort* port = factory.openPort("com1");
        EXPECT_NE(port, nullptr) << factory.lastError();
        return port;
    }
    ISerialPort* openConfigured(int baud = 115200) {
        ISerialPort* port = openPort();
        if (port != nullptr) {
            EXPECT_NE(port->configure(baud, 0, 8, 1, 0), 0) << factory.lastError();
        }
        return port;
    }

    PseudoTerminal terminal;
    runtime::PosixSerialFactory factory;
};
