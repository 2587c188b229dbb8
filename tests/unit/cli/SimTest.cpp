// mrtu sim: a line that others can open.
#include <gtest/gtest.h>
#include <signal.h>

#include <filesystem>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::RunningSim;

TEST(SimTest, AnnouncesItsDeviceAndAnExampleThatWorks) {
    const RunningSim sim({"--ascii", "--node", "17", "--plain"});
    EXPECT_EQ("simulated ASCII line: " + sim.device() + "\ntry: mrtu read --port " + sim.device() +
                  " --ascii '17?HREG?400001?unsignedShort'\nCtrl-C ends it.\n",
              sim.announcement());
    const auto outcome =
        mrtu({"read", "--port", sim.device(), "--ascii", "17?HREG?400001?unsignedShort"});
    EXPECT_EQ("17?HREG?400001?unsignedShort = 17000\n", outcome.out) << outcome.err;
}

TEST(SimTest, EndsWithAnEndSignalAndTakesItsLinkAway) {
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
        const std::string link = cli_test::scratchFile("line");
        RunningSim sim({"--link", link});
        EXPECT_EQ(link, sim.device());
        EXPECT_TRUE(std::filesystem::is_symlink(link));
        EXPECT_EQ(0, sim.end(signal));
        EXPECT_FALSE(std::filesystem::is_symlink(link));
    }
}

TEST(SimTest, OnlyNamedNodesAnswer) {
    const RunningSim sim({"--node", "3", "--node", "4"});
    const auto outcome = mrtu({"read", "--port", sim.device(), "--timeout", "100", "--set",
                               "repeat=0", "3?OUTP?1?boolean", "5?OUTP?1?boolean"});
    EXPECT_EQ("3?OUTP?1?boolean = 1\n", outcome.out);
    EXPECT_EQ(4, outcome.exitCode);
}

/// As a USB adapter does it; the driver's own gap at 115200 baud is 2 ms.
TEST(SimTest, RepliesWithPausesNeedALongerGap) {
    const RunningSim sim({"--fault", "drip=4/100,times=100"});
    const std::vector<std::string> read{"read",   "--port", sim.device(), "--baud",
                                        "115200", "--set",  "repeat=0",   "1?HREG?400001?int"};
    std::vector<std::string> patient = read;
    patient.insert(patient.end(), {"--min-gap", "1000"});
    EXPECT_EQ("1?HREG?400001?int = 65602536\n", mrtu(patient).out);

    const auto hasty = mrtu(read);
    EXPECT_EQ(5, hasty.exitCode);
    EXPECT_NE(hasty.err.find("error -6"), std::string::npos) << hasty.err;
}

TEST(SimTest, DoesNotReplaceAFileByItsLink) {
    const std::string file = cli_test::scratchFile("precious");
    cli_test::writeFile(file, "kept");
    const auto outcome = mrtu({"sim", "--link", file});
    EXPECT_EQ(3, outcome.exitCode);
    EXPECT_NE(outcome.err.find(file), std::string::npos) << outcome.err;
    EXPECT_EQ("kept", cli_test::contentsOf(file));
}

TEST(SimTest, DoesNotReplaceALinkThatItDidNotMake) {
    const std::string link = cli_test::scratchFile("real_port");
    std::filesystem::create_symlink("/dev/ttyUSB7", link);
    const auto outcome = mrtu({"sim", "--link", link});
    EXPECT_EQ(3, outcome.exitCode);
    EXPECT_NE(outcome.err.find(link + ": File exists"), std::string::npos) << outcome.err;
    EXPECT_EQ("/dev/ttyUSB7", std::filesystem::read_symlink(link));
}

}  // namespace
