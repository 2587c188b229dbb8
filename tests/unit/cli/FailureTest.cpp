// What is not there, not allowed or not what it should be.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::contentsOf;
using cli_test::mrtu;
using cli_test::Outcome;
using cli_test::scratchFile;
using cli_test::scratchFolder;

const std::string kUri = "1?HREG?400001?unsignedShort";

Outcome readOn(const std::string& port) {
    return mrtu({"read", "--port", port, kUri});
}

TEST(Port, ThatIsNotThereIsNamedWithTheReason) {
    const std::string device = scratchFolder() + "/nothing";
    const Outcome outcome = readOn("com1=" + device);
    EXPECT_EQ(outcome.err,
              "mrtu: Can't open serial port: com1: " + device + ": No such file or directory\n");
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.exitCode, 3);
}

TEST(Port, ThatIsNoTerminalIsNamedWithTheReason) {
    const Outcome outcome = readOn("com1=/dev/null");
    EXPECT_EQ(outcome.err, "mrtu: Can't open serial port: com1: /dev/null: not a terminal\n");
    EXPECT_EQ(outcome.exitCode, 3);
}

TEST(Port, ThatMayNotBeOpenedIsNamedWithTheReason) {
    const cli_test::RunningSim sim({});
    ASSERT_EQ(chmod(sim.device().c_str(), 0), 0);
    const Outcome outcome =
        mrtu({"read", "--port", sim.device(), "--storage", "none", kUri}, {.unprivileged = true});
    if (outcome.exitCode >= 126) GTEST_SKIP() << "the unprivileged user can't run the command";
    EXPECT_EQ(outcome.err,
              "mrtu: Can't open serial port: com1: " + sim.device() + ": Permission denied\n");
    EXPECT_EQ(outcome.exitCode, 3);
}

TEST(Port, ThatTheConfigurationUsesMustBeGiven) {
    const Outcome outcome = mrtu({"read", "--port", "com2=/dev/null", kUri});
    EXPECT_EQ(outcome.err,
              "mrtu: Can't open serial port: com1: no device is mapped to this port\n");
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_EQ(mrtu({"read", "--port", "com99=/dev/null", kUri}).exitCode, 2);
}

TEST(Port, ThatVanishesIsNoSilentDevice) {
    cli_test::RunningSim sim({"--fault", "hangup"});
    const Outcome outcome = readOn(sim.device());
    EXPECT_EQ(outcome.err, "mrtu: " + kUri + ": error -4: No response\nmrtu: the port is gone\n");
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_EQ(sim.end(0), 3);
}

/// No further attempt finds the port gone when the only one waited for its reply.
TEST(Port, ThatVanishesUnderTheOnlyAttemptIsNoSilentDevice) {
    cli_test::RunningSim sim({"--fault", "hangup"});
    const Outcome outcome = mrtu({"read", "--port", sim.device(), "--set", "repeat=0", kUri});
    EXPECT_EQ(outcome.err, "mrtu: " + kUri + ": error -4: No response\nmrtu: the port is gone\n");
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_EQ(sim.end(0), 3);
}

TEST(Port, WithBaudRateZeroCannotBeOpened) {
    const Outcome outcome = mrtu({"read", "--sim", "--set", "baudrate=0", kUri});
    EXPECT_EQ(outcome.err.rfind("mrtu: Can't open serial port", 0), 0U) << outcome.err;
    EXPECT_EQ(outcome.exitCode, 3);
}

TEST(PlugIn, ThatIsNotThereIsNamed) {
    const std::string file = scratchFolder() + "/missing.so";
    const Outcome outcome = mrtu({"read", "--sim", "--plugin", file, kUri});
    EXPECT_EQ(outcome.err, "mrtu: " + file + ": No such file or directory\n");
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_EQ(mrtu({"info", "--plugin", file}).exitCode, 1);
}

TEST(PlugIn, ThatIsNoLibraryIsNamed) {
    const std::string file = scratchFile("text.so");
    cli_test::writeFile(file, "no library\n");
    const Outcome outcome = mrtu({"read", "--sim", "--plugin", file, kUri});
    EXPECT_EQ(outcome.err.rfind("mrtu: " + file + ": not a loadable library", 0), 0U)
        << outcome.err;
    EXPECT_EQ(outcome.exitCode, 1);
}

TEST(PlugIn, HasOnlyItsOwnProtocols) {
    const Outcome outcome = mrtu({"read", "--sim", "--protocol", "MRTU ", kUri});
    EXPECT_NE(outcome.err.find("unknown protocol 'MRTU '"), std::string::npos) << outcome.err;
    EXPECT_EQ(outcome.exitCode, 1);
}

TEST(Output, ThatCannotBeWrittenIsAFailure) {
    const Outcome full = mrtu({"read", "--sim", kUri}, {.outFile = "/dev/full"});
    EXPECT_EQ(full.err, "mrtu: the output can't be written\n");
    EXPECT_EQ(full.exitCode, 1);
    const Outcome closed = mrtu({"read", "--sim", kUri}, {.outClosed = true});
    EXPECT_EQ(closed.err, "mrtu: the output can't be written\n");
    EXPECT_EQ(closed.exitCode, 1);
}

TEST(Output, ThatIsClosedDoesNotEndUpOnTheLine) {
    const cli_test::RunningSim sim({});
    const Outcome outcome =
        mrtu({"write", "--port", sim.device(), "1?HREG?400001?short=5"}, {.outClosed = true});
    EXPECT_EQ(outcome.exitCode, 1);
    // Text on the line would have stood before the next request and spoilt it.
    const Outcome after = mrtu({"read", "--port", sim.device(), "--set", "repeat=0", kUri});
    EXPECT_EQ(after.out, kUri + " = 5\n") << after.err;
}

}  // namespace
