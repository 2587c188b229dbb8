// mrtu sim: a line that others can open.
#include <gtest/gtest.h>
#include <signal.h>

#include <chrono>
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

/// Exit code and both outputs of one read without a second try, as fast as the node is.
cli_test::Outcome readOnce(const RunningSim& sim, const std::string& timeoutMs,
                           const std::vector<std::string>& uris) {
    std::vector<std::string> words{"read",    "--port", sim.device(), "--timeout",
                                   timeoutMs, "--set",  "repeat=0"};
    words.insert(words.end(), uris.begin(), uris.end());
    return mrtu(words);
}

TEST(SimTest, CharactersTakeTheirTime) {
    const RunningSim sim({"--baud", "600", "--parity", "even", "--bits", "7"});
    EXPECT_NE(sim.announcement().find(sim.device() + " --baud 600 '1?"), std::string::npos)
        << sim.announcement();
    const auto begin = std::chrono::steady_clock::now();
    const auto outcome = mrtu({"read", "--port", sim.device(), "--baud", "600", "--timeout",
                               "10000", "1?HREG?400001?unsignedShort"});
    const auto taken = std::chrono::steady_clock::now() - begin;
    EXPECT_EQ("1?HREG?400001?unsignedShort = 1000\n", outcome.out) << outcome.err;
    // Request, 3.5 characters of silence and reply, 10 bits each.
    EXPECT_GE(taken, std::chrono::milliseconds((80 + 35 + 70) * 1000 / 600));
}

TEST(SimTest, ATurnaroundAboveTheTimeoutIsNoResponse) {
    const RunningSim sim({"--turnaround", "0..1", "--turnaround", "3:60000", "--seed", "7"});
    EXPECT_EQ(4, readOnce(sim, "100", {"3?HREG?400001?unsignedShort"}).exitCode);
    EXPECT_EQ("4?HREG?400001?unsignedShort = 4000\n",
              readOnce(sim, "10000", {"4?HREG?400001?unsignedShort"}).out);
}

TEST(SimTest, WhatIsSaidForOneNodeCountsMoreThanWhatIsSaidForAll) {
    const RunningSim sim({"--away", "3:1/0", "--away", "0/1"});
    EXPECT_EQ("3?HREG?400001?unsignedShort = 3000\n",
              readOnce(sim, "10000", {"3?HREG?400001?unsignedShort"}).out);
    EXPECT_EQ(4, readOnce(sim, "100", {"1?HREG?400001?unsignedShort"}).exitCode);
}

TEST(SimTest, DeadNodesDoNotAnswer) {
    const RunningSim sim({"--dead", "2", "--dead", "3"});
    const auto outcome = readOnce(sim, "100", {"1?OUTP?2?boolean", "2?OUTP?1?boolean"});
    EXPECT_EQ("1?OUTP?2?boolean = 0\n", outcome.out);
    EXPECT_EQ(4, outcome.exitCode);
}

TEST(SimTest, RefusedRangesAreAnsweredWithAnException) {
    const RunningSim sim({"--refuse", "HREG:100-199", "--refuse", "2:IREG:7"});
    for (const char* const uri :
         {"1?HREG?400101?unsignedShort", "2?HREG?400200?int", "2?IREG?300008?short"}) {
        const auto outcome = readOnce(sim, "10000", {uri});
        EXPECT_EQ(5, outcome.exitCode) << uri;
        EXPECT_NE(outcome.err.find("Illegal data address"), std::string::npos) << outcome.err;
    }
    EXPECT_EQ("1?IREG?300008?short = 31007\n", readOnce(sim, "10000", {"1?IREG?300008?short"}).out);
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
