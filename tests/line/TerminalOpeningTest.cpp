// Opening, settings and release of ports.
#include <gmock/gmock.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <cerrno>
#include <cstdio>

#include "runtime/PosixSerialPort.h"
#include "tests/line/PseudoTerminal.h"

namespace {

using runtime::PosixSerialFactory;
using ::testing::HasSubstr;

int descriptorOf(ISerialPort* port) {
    return static_cast<runtime::PosixSerialPort*>(port)->descriptor();
}

void expectSameSettings(const termios& a, const termios& b) {
    EXPECT_EQ(a.c_iflag, b.c_iflag);
    EXPECT_EQ(a.c_oflag, b.c_oflag);
    EXPECT_EQ(a.c_cflag, b.c_cflag);
    EXPECT_EQ(a.c_lflag, b.c_lflag);
    EXPECT_EQ(::cfgetispeed(&a), ::cfgetispeed(&b));
    EXPECT_EQ(::cfgetospeed(&a), ::cfgetospeed(&b));
    for (int i = 0; i < NCCS; ++i)
        EXPECT_EQ(a.c_cc[i], b.c_cc[i]) << "character " << i;
}

using TerminalOpeningTest = LineTest;

TEST_F(TerminalOpeningTest, UnmappedNamesHaveNoPort) {
    EXPECT_EQ(nullptr, factory.openPort("com2"));
    EXPECT_EQ("com2: no device is mapped to this port", factory.lastError());
    for (const char* name : {"com0", "com17", "COM1", "com01", "com1 ", ""}) {
        EXPECT_EQ(nullptr, factory.openPort(name)) << name;
        EXPECT_EQ(std::string(name) + ": not a port name (com1 .. com16)", factory.lastError());
    }
    EXPECT_EQ(nullptr, factory.openPort(nullptr));
}

TEST_F(TerminalOpeningTest, AllSixteenNamesCanBeMappedAndUnmapped) {
    for (int number = 1; number <= 16; ++number) {
        const std::string name = "com" + std::to_string(number);
        EXPECT_TRUE(factory.mapPort(name, "/dev/somewhere")) << name;
        EXPECT_EQ("/dev/somewhere", factory.deviceOf(name)) << name;
    }
    EXPECT_FALSE(factory.mapPort("com17", "/dev/somewhere"));
    EXPECT_TRUE(factory.mapPort("com3", ""));
    EXPECT_EQ("", factory.deviceOf("com3"));
}

TEST_F(TerminalOpeningTest, DeviceThatIsNotThereIsNamed) {
    factory.mapPort("com1", "/dev/ttyNowhere9");
    EXPECT_EQ(nullptr, factory.openPort("com1"));
    EXPECT_EQ("com1: /dev/ttyNowhere9: No such file or directory", factory.lastError());
}

TEST_F(TerminalOpeningTest, WhatIsNoTerminalIsRefused) {
    factory.mapPort("com1", "/dev/null");
    EXPECT_EQ(nullptr, factory.openPort("com1"));
    EXPECT_EQ("com1: /dev/null: not a terminal", factory.lastError());
    factory.mapPort("com1", "/");
    EXPECT_EQ(nullptr, factory.openPort("com1"));
    EXPECT_EQ("com1: /: Is a directory", factory.lastError());
}

TEST_F(TerminalOpeningTest, FifoIsRefusedWithoutWaitingForItsOtherEnd) {
    const std::string fifo = ::testing::TempDir() + "fifo" + std::to_string(::getpid());
    ASSERT_EQ(0, ::mkfifo(fifo.c_str(), 0600));
    factory.mapPort("com1", fifo);
    EXPECT_EQ(nullptr, factory.openPort("com1"));
    std::remove(fifo.c_str());
    EXPECT_EQ("com1: " + fifo + ": not a terminal", factory.lastError());
}

TEST_F(TerminalOpeningTest, SuccessfulOpenClearsTheError) {
    EXPECT_EQ(nullptr, factory.openPort("com2"));
    EXPECT_NE(openPort(), nullptr);
    EXPECT_EQ("", factory.lastError());
}

TEST_F(TerminalOpeningTest, SettingsComeBackAtTheRelease) {
    termios unusual = terminal.settings();
    unusual.c_iflag = IXON | ICRNL;
    unusual.c_cc[VMIN] = 3;
    unusual.c_cc[VTIME] = 9;
    unusual.c_cflag |= CSTOPB;
    ::cfsetispeed(&unusual, B1200);
    ::cfsetospeed(&unusual, B1200);
    ASSERT_EQ(0, ::tcsetattr(terminal.watch(), TCSANOW, &unusual));
    const termios before = terminal.settings();

    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    ASSERT_NE(port->configure(19200, 1, 7, 1, 0), 0) << factory.lastError();
    ASSERT_NE(port->configure(57600, 0, 8, 2, 0), 0) << factory.lastError();
    const termios during = terminal.settings();
    EXPECT_EQ(speed_t{B57600}, ::cfgetospeed(&during));
    EXPECT_EQ(0u, during.c_lflag & (ICANON | ECHO));

    factory.releasePort(port);
    expectSameSettings(terminal.settings(), before);
}

TEST_F(TerminalOpeningTest, DestroyedFactoryReleasesItsPorts) {
    const termios before = terminal.settings();
    {
        PosixSerialFactory shortLived;
        shortLived.mapPort("com5", terminal.path());
        ISerialPort* port = shortLived.openPort("com5");
        ASSERT_NE(port, nullptr);
        ASSERT_NE(port->configure(9600, 0, 8, 1, 0), 0);
        EXPECT_EQ(1, shortLived.openPorts());
    }
    expectSameSettings(terminal.settings(), before);
    EXPECT_NE(openPort(), nullptr);
}

TEST_F(TerminalOpeningTest, EveryListedSettingIsAccepted) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    for (const int baud : {150, 300, 600, 1200, 2400, 4800, 9600, 19200, 38400, 57600, 115200}) {
        for (int parity = 0; parity <= 4; ++parity) {
            for (const int dataBits : {7, 8}) {
                for (const int stopBits : {1, 2}) {
                    EXPECT_NE(port->configure(baud, parity, dataBits, stopBits, 0), 0)
                        << baud << " parity " << parity << " bits " << dataBits << " stop "
                        << stopBits << ": " << factory.lastError();
                }
            }
        }
    }
}

TEST_F(TerminalOpeningTest, PortWithoutDirectionControlWorksInEveryMode) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    for (int mode = 0; mode <= 3; ++mode) {
        EXPECT_NE(port->configure(9600, 0, 8, 1, mode), 0) << mode << factory.lastError();
    }
}

TEST_F(TerminalOpeningTest, RateOfZeroFailsWithItsReason) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    EXPECT_EQ(0, port->configure(0, 0, 8, 1, 0));
    EXPECT_EQ("com1: " + terminal.path() + ": baud rate 0 is not supported", factory.lastError());
    const unsigned char byte = 1;
    EXPECT_EQ(0, port->send(&byte, 1));
}

TEST_F(TerminalOpeningTest, SecondOpenInThisProcessIsRefused) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    PosixSerialFactory other;
    other.mapPort("com7", terminal.path());
    EXPECT_EQ(nullptr, other.openPort("com7"));
    EXPECT_EQ("com7: " + terminal.path() + ": in use", other.lastError());

    factory.releasePort(port);
    EXPECT_NE(other.openPort("com7"), nullptr) << other.lastError();
}

TEST_F(TerminalOpeningTest, RefusedSecondOpenLeavesTheFirstExclusive) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    PosixSerialFactory other;
    other.mapPort("com7", terminal.path());
    EXPECT_EQ(nullptr, other.openPort("com7"));
    int exclusive = 0;
#ifdef MRTU_EMULATED
    // The emulator passes TIOCEXCL on, but does not know the question whether it is set.
    if (::ioctl(terminal.watch(), TIOCGEXCL, &exclusive) != 0 && errno == ENOSYS)
        GTEST_SKIP() << "qemu-user has no TIOCGEXCL";
#endif
    ASSERT_EQ(0, ::ioctl(terminal.watch(), TIOCGEXCL, &exclusive));
    EXPECT_NE(exclusive, 0);
    factory.releasePort(port);
    ASSERT_EQ(0, ::ioctl(terminal.watch(), TIOCGEXCL, &exclusive));
    EXPECT_EQ(0, exclusive);
}

/// Runs `check` in a child process. @return its exit status.
template <class Check>
int inChild(Check check) {
    const pid_t child = ::fork();
    if (child == 0) ::_exit(check());
    int status = 0;
    EXPECT_EQ(child, ::waitpid(child, &status, 0));
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

TEST_F(TerminalOpeningTest, SecondOpenByAnotherProcessIsRefused) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    const auto tryToOpen = [this] {
        PosixSerialFactory other;
        other.mapPort("com1", terminal.path());
        const bool refused = other.openPort("com1") == nullptr;
        const bool said = other.lastError().ends_with(": in use");
        return refused && said ? 7 : 1;
    };
    EXPECT_EQ(7, inChild(tryToOpen));
}

TEST_F(TerminalOpeningTest, DescriptorIsNotInheritedByOtherPrograms) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    EXPECT_NE(::fcntl(descriptorOf(port), F_GETFD) & FD_CLOEXEC, 0);
    EXPECT_NE(::fcntl(descriptorOf(port), F_GETFL) & O_NONBLOCK, 0);
}

TEST_F(TerminalOpeningTest, PortDoesNotBecomeTheControllingTerminal) {
    const auto openAsLeader = [this] {
        if (::setsid() < 0) return 1;
        PosixSerialFactory other;
        other.mapPort("com1", terminal.path());
        if (other.openPort("com1") == nullptr) return 2;
        const int controlling = ::open("/dev/tty", O_RDWR);
        return controlling < 0 && errno == ENXIO ? 7 : 3;
    };
    EXPECT_EQ(7, inChild(openAsLeader));
}

TEST_F(TerminalOpeningTest, ForeignPortsAreNotReleased) {
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    PosixSerialFactory other;
    other.releasePort(port);
    other.releasePort(nullptr);
    EXPECT_EQ(1, factory.openPorts());
    factory.releasePort(port);
    factory.releasePort(port);
    EXPECT_EQ(0, factory.openPorts());
}

TEST_F(TerminalOpeningTest, PortOfAVanishedTerminalCanStillBeReleased) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.hangUp();
    EXPECT_EQ(0, port->configure(9600, 0, 8, 1, 0));
    EXPECT_THAT(factory.lastError(), HasSubstr(terminal.path()));
    factory.releasePort(port);
    EXPECT_EQ(0, factory.openPorts());
}

}  // namespace
