// Bytes and frames over a real pseudo terminal. Waits that must not happen are given times that
// no test would survive, so that nothing here depends on how fast the machine is.
#include <gmock/gmock.h>
#include <pthread.h>

#include <array>
#include <atomic>
#include <chrono>
#include <csignal>
#include <limits>
#include <thread>

#include "tests/line/PseudoTerminal.h"

namespace {

using ::testing::ElementsAre;
using Bytes = std::vector<std::uint8_t>;

constexpr int kForEver = std::numeric_limits<int>::max();

struct Frame {
    int good;
    Bytes bytes;
};

Frame receiveFrame(ISerialPort& port, int most, int timeoutMs, int gapMs) {
    Bytes buffer(static_cast<std::size_t>(most));
    int received = -1;
    const int good = port.receiveFrame(buffer.data(), most, timeoutMs, gapMs, &received, 0);
    buffer.resize(static_cast<std::size_t>(received));
    return {good, buffer};
}

/// Runs an action beside the test until the end of the scope.
class Meanwhile {
  public:
    template <class Action>
    explicit Meanwhile(Action action)
        : thread_([this, action = std::move(action)] { action(stopped_); }) {}
    ~Meanwhile() {
        stopped_ = true;
        thread_.join();
    }
    Meanwhile(const Meanwhile&) = delete;
    Meanwhile& operator=(const Meanwhile&) = delete;

  private:
    std::atomic<bool> stopped_{false};
    std::thread thread_;
};

using TerminalTransferTest = LineTest;

TEST_F(TerminalTransferTest, EveryByteValuePassesBothWays) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    Bytes all(256);
    for (std::size_t i = 0; i < all.size(); ++i)
        all[i] = static_cast<std::uint8_t>(i);

    termios raw = terminal.settings();
    ASSERT_NE(port->send(all.data(), static_cast<int>(all.size())), 0);
    EXPECT_EQ(all, terminal.take(all.size()));
    terminal.put(all);
    const Frame frame = receiveFrame(*port, 256, kForEver, kForEver);
    EXPECT_NE(frame.good, 0);
    EXPECT_EQ(all, frame.bytes);
    EXPECT_EQ(0u, raw.c_oflag & OPOST);
}

TEST_F(TerminalTransferTest, FirstByteThenTheRest) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 3, 2, 0xAB});
    unsigned char first = 0;
    ASSERT_NE(port->receiveByte(&first, kForEver, 0), 0);
    EXPECT_EQ(1, first);
    const Frame rest = receiveFrame(*port, 512, kForEver, 20);
    EXPECT_NE(rest.good, 0);
    EXPECT_THAT(rest.bytes, ElementsAre(3, 2, 0xAB));
}

TEST_F(TerminalTransferTest, TimeoutOfZeroOnlyLooks) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    unsigned char byte = 0x77;
    EXPECT_EQ(0, port->receiveByte(&byte, 0, 0));
    EXPECT_EQ(0x77, byte);
    terminal.put({5});
    ASSERT_NE(port->receiveByte(&byte, kForEver, 0), 0);
    EXPECT_EQ(5, byte);
}

TEST_F(TerminalTransferTest, SilenceEndsAFrame) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 2, 3, 4, 5});
    EXPECT_THAT(receiveFrame(*port, 512, kForEver, 20).bytes, ElementsAre(1, 2, 3, 4, 5));
}

TEST_F(TerminalTransferTest, MaximumEndsAFrame) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 2, 3, 4, 5});
    EXPECT_THAT(receiveFrame(*port, 2, kForEver, kForEver).bytes, ElementsAre(1, 2));
    EXPECT_THAT(receiveFrame(*port, 3, kForEver, kForEver).bytes, ElementsAre(3, 4, 5));
}

TEST_F(TerminalTransferTest, DeadlineEndsAFrameThatIsSilentTooShortly) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 2});
    const Frame frame = receiveFrame(*port, 512, 50, kForEver);
    EXPECT_NE(frame.good, 0);
    EXPECT_THAT(frame.bytes, ElementsAre(1, 2));
}

TEST_F(TerminalTransferTest, DripsForEverAreBoundedByTheDeadline) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    const Meanwhile dripping([this](const std::atomic<bool>& stopped) {
        const std::uint8_t drop = 0x55;
        while (!stopped && ::write(terminal.far(), &drop, 1) == 1) {
            std::this_thread::sleep_for(std::chrono::milliseconds{1});
        }
    });
    // Neither the gap nor the maximum can end this one.
    const Frame frame = receiveFrame(*port, 1'000'000, 100, kForEver);
    EXPECT_NE(frame.good, 0);
    EXPECT_GT(frame.bytes.size(), 0u);
    EXPECT_LT(frame.bytes.size(), 1'000'000u);
}

TEST_F(TerminalTransferTest, FrameOfNothingFails) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    const Frame frame = receiveFrame(*port, 512, kForEver, 1);
    EXPECT_EQ(0, frame.good);
    EXPECT_TRUE(frame.bytes.empty());
}

TEST_F(TerminalTransferTest, GapFloorBridgesPausesThatTheDriverWouldNot) {
    factory.setGapFloor(kForEver);
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1});
    const Meanwhile answering([this](const std::atomic<bool>&) {
        std::this_thread::sleep_for(std::chrono::milliseconds{30});
        const Bytes rest{2, 3};
        EXPECT_EQ(2, ::write(terminal.far(), rest.data(), rest.size()));
    });
    EXPECT_THAT(receiveFrame(*port, 3, kForEver, 1).bytes, ElementsAre(1, 2, 3));
}

TEST_F(TerminalTransferTest, PurgeThrowsAwayWhatWasReceived) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 2, 3});
    unsigned char byte = 0;
    ASSERT_NE(port->receiveByte(&byte, kForEver, 0), 0);
    port->purge();
    EXPECT_EQ(0, port->receiveByte(&byte, 0, 0));
}

TEST_F(TerminalTransferTest, ConfigureStartsWithAnEmptyLine) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1, 2, 3});
    unsigned char byte = 0;
    ASSERT_NE(port->receiveByte(&byte, kForEver, 0), 0);
    ASSERT_NE(port->configure(9600, 0, 8, 1, 0), 0);
    EXPECT_EQ(0, port->receiveByte(&byte, 0, 0));
}

TEST_F(TerminalTransferTest, NegativeLengthIsRefused) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    const unsigned char byte = 1;
    EXPECT_EQ(0, port->send(&byte, -1));
    EXPECT_NE(port->send(&byte, 0), 0);
}

TEST_F(TerminalTransferTest, SendWithoutSettingsStillHasATime) {
    // A port that was never configured sends at the default rate of its settings.
    ISerialPort* port = openPort();
    ASSERT_NE(port, nullptr);
    const unsigned char byte = 'x';
    EXPECT_NE(port->send(&byte, 1), 0);
    EXPECT_THAT(terminal.take(1), ElementsAre('x'));
}

TEST_F(TerminalTransferTest, HangUpFailsEveryTransferAtOnceAndForGood) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.hangUp();
    for (int round = 0; round < 3; ++round) {
        unsigned char byte = 0x77;
        EXPECT_EQ(0, port->receiveByte(&byte, kForEver, 0));
        EXPECT_EQ(0x77, byte);
        const Frame frame = receiveFrame(*port, 512, kForEver, kForEver);
        EXPECT_EQ(0, frame.good);
        EXPECT_TRUE(frame.bytes.empty());
        EXPECT_EQ(0, port->send(&byte, 1));
        port->purge();
    }
}

/// Each transfer must be the one that notices, so each gets a line of its own.
TEST_F(TerminalTransferTest, HangUpFailsAFrameFirst) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.hangUp();
    EXPECT_EQ(0, receiveFrame(*port, 512, kForEver, kForEver).good);
}

TEST_F(TerminalTransferTest, HangUpFailsASendFirst) {
    ISerialPort* port = openConfigured(150);
    ASSERT_NE(port, nullptr);
    terminal.hangUp();
    const Bytes data(100'000);  // Two hours of sending at this rate.
    EXPECT_EQ(0, port->send(data.data(), static_cast<int>(data.size())));
}

TEST_F(TerminalTransferTest, HangUpEndsAWaitForTheFirstByte) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    const Meanwhile hangingUp([this](const std::atomic<bool>&) {
        std::this_thread::sleep_for(std::chrono::milliseconds{20});
        terminal.hangUp();
    });
    unsigned char byte = 0;
    EXPECT_EQ(0, port->receiveByte(&byte, kForEver, 0));
}

TEST_F(TerminalTransferTest, HangUpEndsAFrameAndKeepsWhatCame) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    terminal.put({1});
    unsigned char byte = 0;
    ASSERT_NE(port->receiveByte(&byte, kForEver, 0), 0);
    const Meanwhile hangingUp([this](const std::atomic<bool>&) {
        std::this_thread::sleep_for(std::chrono::milliseconds{20});
        terminal.hangUp();
    });
    EXPECT_EQ(0, receiveFrame(*port, 512, kForEver, kForEver).good);
}

TEST_F(TerminalTransferTest, SendToAReaderThatNeverReadsEndsAtItsDeadline) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    // What the kernel holds for a pseudo terminal is finite; a jammed line must not hold us.
    const Bytes much(16'000, 0x55);
    int rounds = 0;
    while (rounds < 100 && port->send(much.data(), static_cast<int>(much.size())) != 0)
        ++rounds;
    EXPECT_LT(rounds, 100);
    unsigned char byte = 0;
    EXPECT_EQ(0, port->receiveByte(&byte, 0, 0));
    terminal.put({9});
    EXPECT_NE(port->receiveByte(&byte, kForEver, 0), 0) << "the line itself is still there";
}

std::atomic<int> signalsSeen{0};

TEST_F(TerminalTransferTest, SignalsDoNotCutWaitsShort) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(port, nullptr);
    struct sigaction action {};
    action.sa_handler = [](int) { ++signalsSeen; };
    struct sigaction before {};
    ASSERT_EQ(0, ::sigaction(SIGUSR1, &action, &before));
    const pthread_t waiting = ::pthread_self();
    unsigned char byte = 0;
    {
        const Meanwhile disturbing([this, waiting](const std::atomic<bool>&) {
            while (signalsSeen < 10) {
                ::pthread_kill(waiting, SIGUSR1);
                std::this_thread::sleep_for(std::chrono::milliseconds{1});
            }
            const std::uint8_t answer = 0x42;
            EXPECT_EQ(1, ::write(terminal.far(), &answer, 1));
        });
        EXPECT_NE(port->receiveByte(&byte, kForEver, 0), 0);
    }
    ::sigaction(SIGUSR1, &before, nullptr);
    EXPECT_EQ(0x42, byte);
    EXPECT_GE(signalsSeen, 10);
}

}  // namespace
