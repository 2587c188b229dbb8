// A signal that ends the command: at once, with the port as it was found.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/serial.h>
#include <signal.h>
#include <sys/file.h>
#include <sys/ioctl.h>

#include <cstring>

#include "tests/line/PseudoTerminal.h"
#include "tests/unit/cli/Child.h"

namespace {

using cli_test::Outcome;
using cli_test::RunningCommand;

constexpr const char* kUri = "1?HREG?400001?unsignedShort";
constexpr std::size_t kRequestBytes = 8;
const std::vector<std::uint8_t> kReply{0x01, 0x03, 0x02, 0x03, 0xE8, 0xB8, 0xFA};

/// A terminal that somebody has set up in a way of his own, and a command that waits on it for an
/// answer that does not come.
class SignalTest : public testing::TestWithParam<int> {
  protected:
    void SetUp() override {
        termios own = terminal_.settings();
        cfsetspeed(&own, B300);
        own.c_iflag |= ICRNL | IXON;
        own.c_lflag |= ICANON | ECHO;
        own.c_cc[VMIN] = 7;
        ASSERT_EQ(0, tcsetattr(terminal_.watch(), TCSANOW, &own));
        found_ = terminal_.settings();
    }

    std::vector<std::string> words(std::vector<std::string> command) const {
        command.insert(command.end(), {"--port", terminal_.path(), "--storage", "none", "--timeout",
                                       "600000", "--set", "mode=RS-485"});
        return command;
    }

    /// Afterwards the port is open, set up, and the request sent.
    void waitForRequest() const {
        ASSERT_EQ(kRequestBytes, terminal_.take(kRequestBytes).size());
        ASSERT_FALSE(isAsFound());
    }

    bool isAsFound() const {
        const termios now = terminal_.settings();
        return now.c_iflag == found_.c_iflag && now.c_oflag == found_.c_oflag &&
               now.c_cflag == found_.c_cflag && now.c_lflag == found_.c_lflag &&
               std::memcmp(now.c_cc, found_.c_cc, sizeof now.c_cc) == 0;
    }

    /// As found, and free for the next program.
    void expectAsFound() const {
        EXPECT_TRUE(isAsFound());
        int exclusive = -1;
        EXPECT_EQ(0, ioctl(terminal_.watch(), TIOCGEXCL, &exclusive));
        EXPECT_EQ(0, exclusive);
        EXPECT_EQ(0, flock(terminal_.watch(), LOCK_EX | LOCK_NB));
    }

    PseudoTerminal terminal_;
    termios found_{};
};

std::string nameOf(const testing::TestParamInfo<int>& row) {
    return sigabbrev_np(row.param);
}
INSTANTIATE_TEST_SUITE_P(Each, SignalTest, testing::Values(SIGINT, SIGTERM, SIGHUP), nameOf);

TEST_P(SignalTest, EndsAWaitingReadAndPutsThePortBack) {
    RunningCommand read(words({"read", kUri}));
    waitForRequest();
    read.send(GetParam());
    const Outcome outcome = read.end();
    EXPECT_EQ(128 + GetParam(), outcome.exitCode) << outcome.err;
    EXPECT_EQ("", outcome.out + outcome.err);
    expectAsFound();
}

TEST_P(SignalTest, EndsAWriteAndAConsoleCommand) {
    const std::vector<std::string> commands[] = {
        {"write", "1?HREG?400001?short=1"},
        {"console", "read", kUri},
    };
    for (const auto& command : commands) {
        RunningCommand running(words(command));
        waitForRequest();
        running.send(GetParam());
        EXPECT_EQ(128 + GetParam(), running.end().exitCode) << command.front();
        expectAsFound();
        flock(terminal_.watch(), LOCK_UN);
    }
}

TEST_P(SignalTest, TwiceIsNoWorseThanOnce) {
    RunningCommand read(words({"read", kUri}));
    waitForRequest();
    for (int round = 0; round < 3; ++round)
        read.send(GetParam());
    EXPECT_EQ(128 + GetParam(), read.end().exitCode);
    expectAsFound();
}

TEST_P(SignalTest, ThatWasIgnoredAtTheStartStaysIgnored) {
    RunningCommand read(words({"read", kUri}), {.ignoredSignal = GetParam()});
    waitForRequest();
    read.send(GetParam());
    terminal_.put(kReply);
    const Outcome outcome = read.end();
    EXPECT_EQ(std::string(kUri) + " = 1000\n", outcome.out) << outcome.err;
    EXPECT_EQ(0, outcome.exitCode);
    expectAsFound();
}

TEST_P(SignalTest, PutsTheRs485ModeBack) {
    const std::string log = cli_test::scratchFile("rs485");
    // A library in front of the address sanitizer's is all right where it only answers ioctl().
    RunningCommand read(words({"read", kUri}),
                        {.environment = {{"LD_PRELOAD", RS485_TERMINAL},
                                         {"RS485_LOG", log},
                                         {"ASAN_OPTIONS", "verify_asan_link_order=0"}}});
    waitForRequest();
    constexpr int kSending = SER_RS485_ENABLED | SER_RS485_RTS_ON_SEND;
    EXPECT_EQ(std::to_string(kSending) + "\n", cli_test::contentsOf(log));
    read.send(GetParam());
    EXPECT_EQ(128 + GetParam(), read.end().exitCode);
    EXPECT_EQ(std::to_string(kSending) + "\n" + std::to_string(SER_RS485_RTS_AFTER_SEND) + "\n",
              cli_test::contentsOf(log));
}

TEST_P(SignalTest, EndsAConsoleThatIsFedThroughAPipe) {
    RunningCommand console(words({"console"}), {.input = std::string("read ") + kUri + "\n"});
    waitForRequest();
    console.send(GetParam());
    EXPECT_EQ(128 + GetParam(), console.end().exitCode);
    expectAsFound();
}

TEST_P(SignalTest, EndsATypedConsoleAndPutsItsTerminalBackToo) {
    cli_test::TerminalSession console(words({"console"}));
    ASSERT_TRUE(console.shows("mrtu> ")) << console.screen();
    // Ctrl-B goes back by one: only the editor, at work on a raw terminal, shows "bc".
    console.type(
        "ac\x02"
        "b");
    ASSERT_TRUE(console.shows("bc")) << console.screen();
    ASSERT_FALSE(isAsFound());
    ASSERT_EQ(0U, console.settings().c_lflag & ICANON);
    console.send(GetParam());
    EXPECT_EQ(128 + GetParam(), console.end()) << console.screen();
    EXPECT_NE(console.settings().c_lflag & ICANON, 0U);
    EXPECT_NE(console.settings().c_lflag & ECHO, 0U);
    expectAsFound();
}

TEST_F(SignalTest, TypedAsControlCEndsTheConsole) {
    cli_test::TerminalSession console(words({"console"}));
    ASSERT_TRUE(console.shows("mrtu> ")) << console.screen();
    console.type("half a li\x03");
    EXPECT_EQ(128 + SIGINT, console.end()) << console.screen();
    EXPECT_NE(console.settings().c_lflag & ICANON, 0U);
    expectAsFound();
}

}  // namespace
