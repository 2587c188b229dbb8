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

TEST(FailureTest, PortThatIsNotThereIsNamedWithTheReason) {
    const std::string device = scratchFolder() + "/nothing";
    const Outcome outcome = readOn("com1=" + device);
    EXPECT_EQ("mrtu: Can't open serial port: com1: " + device + ": No such file or directory\n",
              outcome.err);
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(3, outcome.exitCode);
}

TEST(FailureTest, PortThatIsNoTerminalIsNamedWithTheReason) {
    const Outcome outcome = readOn("com1=/dev/null");
    EXPECT_EQ("mrtu: Can't open serial port: com1: /dev/null: not a terminal\n", outcome.err);
    EXPECT_EQ(3, outcome.exitCode);
}

TEST(FailureTest, PortThatMayNotBeOpenedIsNamedWithTheReason) {
    const cli_test::RunningSim sim({});
    ASSERT_EQ(0, chmod(sim.device().c_str(), 0));
    const Outcome outcome =
        mrtu({"read", "--port", sim.device(), "--storage", "none", kUri}, {.unprivileged = true});
    if (outcome.exitCode >= 126) GTEST_SKIP() << "the unprivileged user can't run the command";
    EXPECT_EQ("mrtu: Can't open serial port: com1: " + sim.device() + ": Permission denied\n",
              outcome.err);
    EXPECT_EQ(3, outcome.exitCode);
}

TEST(FailureTest, PortThatTheConfigurationUsesMustBeGiven) {
    const Outcome outcome = mrtu({"read", "--port", "com2=/dev/null", kUri});
    EXPECT_EQ("mrtu: Can't open serial port: com1: no device is mapped to this port\n",
              outcome.err);
    EXPECT_EQ(3, outcome.exitCode);
    EXPECT_EQ(2, mrtu({"read", "--port", "com99=/dev/null", kUri}).exitCode);
}

TEST(FailureTest, PortThatVanishesIsNoSilentDevice) {
    cli_test::RunningSim sim({"--fault", "hangup"});
    const Outcome outcome = readOn(sim.device());
    EXPECT_EQ("mrtu: " + kUri + ": error -4: No response\nmrtu: the port is gone\n", outcome.err);
    EXPECT_EQ(3, outcome.exitCode);
    EXPECT_EQ(3, sim.end(0));
}

/// No further attempt finds the port gone when the only one waited for its reply.
TEST(FailureTest, PortThatVanishesUnderTheOnlyAttemptIsNoSilentDevice) {
    cli_test::RunningSim sim({"--fault", "hangup"});
    const Outcome outcome = mrtu({"read", "--port", sim.device(), "--set", "repeat=0", kUri});
    EXPECT_EQ("mrtu: " + kUri + ": error -4: No response\nmrtu: the port is gone\n", outcome.err);
    EXPECT_EQ(3, outcome.exitCode);
    EXPECT_EQ(3, sim.end(0));
}

TEST(FailureTest, PortWithBaudRateZeroCannotBeOpened) {
    const Outcome outcome = mrtu({"read", "--sim", "--set", "baudrate=0", kUri});
    EXPECT_EQ(0U, outcome.err.rfind("mrtu: Can't open serial port", 0)) << outcome.err;
    EXPECT_EQ(3, outcome.exitCode);
}

TEST(FailureTest, PlugInThatIsNotThereIsNamed) {
    const std::string file = scratchFolder() + "/missing.so";
    const Outcome outcome = mrtu({"read", "--sim", "--plugin", file, kUri});
    EXPECT_EQ("mrtu: " + file + ": No such file or directory\n", outcome.err);
    EXPECT_EQ(1, outcome.exitCode);
    EXPECT_EQ(1, mrtu({"info", "--plugin", file}).exitCode);
}

TEST(FailureTest, PlugInThatIsNoLibraryIsNamed) {
    const std::string file = scratchFile("text.so");
    cli_test::writeFile(file, "no library\n");
    const Outcome outcome = mrtu({"read", "--sim", "--plugin", file, kUri});
    EXPECT_EQ(0U, outcome.err.rfind("mrtu: " + file + ": not a loadable library", 0))
        << outcome.err;
    EXPECT_EQ(1, outcome.exitCode);
}

TEST(FailureTest, PlugInHasOnlyItsOwnProtocols) {
    const Outcome outcome = mrtu({"read", "--sim", "--protocol", "MRTU ", kUri});
    EXPECT_NE(outcome.err.find("unknown protocol 'MRTU '"), std::string::npos) << outcome.err;
    EXPECT_EQ(1, outcome.exitCode);
}

TEST(FailureTest, OutputThatCannotBeWrittenIsAFailure) {
    const Outcome full = mrtu({"read", "--sim", kUri}, {.outFile = "/dev/full"});
    EXPECT_EQ("mrtu: the output can't be written\n", full.err);
    EXPECT_EQ(1, full.exitCode);
    const Outcome closed = mrtu({"read", "--sim", kUri}, {.outClosed = true});
    EXPECT_EQ("mrtu: the output can't be written\n", closed.err);
    EXPECT_EQ(1, closed.exitCode);
}

TEST(FailureTest, OutputThatIsClosedDoesNotEndUpOnTheLine) {
    const cli_test::RunningSim sim({});
    const Outcome outcome =
        mrtu({"write", "--port", sim.device(), "1?HREG?400001?short=5"}, {.outClosed = true});
    EXPECT_EQ(1, outcome.exitCode);
    // Text on the line would have stood before the next request and spoilt it.
    const Outcome after = mrtu({"read", "--port", sim.device(), "--set", "repeat=0", kUri});
    EXPECT_EQ(kUri + " = 5\n", after.out) << after.err;
}

}  // namespace
