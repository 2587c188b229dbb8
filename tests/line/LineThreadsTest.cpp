// A port that is set up while another thread talks through it.
#include <atomic>
#include <thread>

#include "tests/line/PseudoTerminal.h"

namespace {

constexpr int kRounds = 100;

using LineThreadsTest = LineTest;

TEST_F(LineThreadsTest, SettingsMayChangeWhileAnotherThreadSendsAndReceives) {
    ISerialPort* port = openConfigured();
    ASSERT_NE(nullptr, port);
    ASSERT_EQ(0, ::fcntl(terminal.far(), F_SETFL, O_NONBLOCK));
    std::atomic<int> failed = 0;
    std::atomic<bool> done = false;
    std::thread talker([&] {
        const unsigned char request[8] = {1, 3, 0, 0, 0, 1, 0x84, 0x0A};
        unsigned char reply[16] = {};
        for (int round = 0; round < kRounds; ++round) {
            int received = 0;
            if (port->send(request, sizeof request) == 0) ++failed;
            while (::read(terminal.far(), reply, sizeof reply) > 0) {
            }
            if (port->receiveByte(reply, 0, 0) != 0) ++failed;  // Nobody answers.
            if (port->receiveFrame(reply, sizeof reply, 1, 1, &received, 0) != 0) ++failed;
        }
        done = true;
    });
    int changes = 0;
    for (; !done || changes < kRounds; ++changes)
        if (port->configure(changes % 2 == 0 ? 19200 : 9600, 0, 8, 1 + changes % 2, 0) == 0)
            ++failed;
    talker.join();
    EXPECT_EQ(0, failed) << factory.lastError();
    EXPECT_NE(0, port->configure(38400, 0, 8, 1, 0));
    const termios inForce = terminal.settings();
    EXPECT_EQ(static_cast<speed_t>(B38400), ::cfgetospeed(&inForce));
    factory.releasePort(port);
}

}  // namespace
