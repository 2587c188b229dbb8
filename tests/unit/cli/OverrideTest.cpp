// mrtu override: what replaces the configuration, and stays.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;

/// A storage of the test's own, on the simulated line.
class OverrideTest : public testing::Test {
  protected:
    Outcome run(std::vector<std::string> words, const std::vector<std::string>& tail) const {
        words.insert(words.end(), {"--sim", "--storage", storage_});
        words.insert(words.end(), tail.begin(), tail.end());
        return mrtu(words);
    }
    Outcome set(const std::vector<std::string>& words) const {
        return run({"override", "set"}, words);
    }
    Outcome clear(const std::vector<std::string>& words) const {
        return run({"override", "clear"}, words);
    }
    std::string list() const { return run({"override", "list"}, {}).out; }

    std::string storage_ = cli_test::scratchFile("overrides.db");
};

constexpr const char* kNothing =
    "node 1 = 1\nmodicon 1 = on\nbaud = 19200\nparity = none\nstop = 1\nmode = RS-232\n";

TEST_F(OverrideTest, WithoutAnyTheConfigurationIsListed) {
    EXPECT_EQ(kNothing, list());
}

TEST_F(OverrideTest, OutlastsItsProcess) {
    const Outcome outcome = set({"node", "5=7", "6=off", "modicon", "5=off", "baud=38400",
                                 "parity=even", "stop=2", "mode=RS-485"});
    EXPECT_EQ(
        "node 5 = 7 (stored)\nnode 6 = off (stored)\nmodicon 5 = off (stored)\n"
        "baud = 38400 (stored)\nparity = even (stored)\nstop = 2 (stored)\n"
        "mode = RS-485 (stored)\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
    EXPECT_EQ(
        "node 1 = 1\nmodicon 1 = on\nnode 5 = 7 (stored)\nmodicon 5 = off (stored)\n"
        "node 6 = off (stored)\nmodicon 6 = on\nbaud = 38400 (stored)\n"
        "parity = even (stored)\nstop = 2 (stored)\nmode = RS-485 (stored)\n",
        list());
}

TEST_F(OverrideTest, ActsOnTheReadsOfALaterProcess) {
    set({"node", "5=7", "6=off", "modicon", "8=off"});
    const Outcome outcome =
        run({"read"}, {"5?HREG?400001?unsignedShort", "6?HREG?400001?unsignedShort",
                       "8?HREG?400001?unsignedShort"});
    // Node 7 answers for node 5; node 8 counts from 0, so its first register is the second.
    EXPECT_EQ("5?HREG?400001?unsignedShort = 7000\n8?HREG?400001?unsignedShort = 8001\n",
              outcome.out);
    EXPECT_NE(outcome.err.find("mrtu: 6?HREG?400001?unsignedShort: error -10: Node disabled\n"),
              std::string::npos)
        << outcome.err;
    EXPECT_EQ(1, outcome.exitCode);
}

TEST_F(OverrideTest, ThatIsInForceIsToldOnceWithTheWayOut) {
    set({"node", "5=7", "baud=38400"});
    const std::string clear = "mrtu override clear --storage " + storage_ + " baud node 5";
    const std::string notice =
        "mrtu: stored overrides of 'MRTU' (all lines without --ident) are in force: baud 38400 "
        "instead of 9600, node 5 = 7; " +
        storage_ + " holds them, '" + clear + "' clears them\n";
    const std::string uri = "1?HREG?400001?unsignedShort";
    EXPECT_EQ(notice, run({"read"}, {"--baud", "9600", uri, uri}).err);
    EXPECT_EQ(notice, run({"write"}, {"--baud", "9600", uri + "=1"}).err);
    EXPECT_EQ(notice, run({"console"}, {"--baud", "9600", "getmaxtm"}).err);
    const Outcome cleared = mrtu({"override", "clear", "--storage", storage_, "baud", "node", "5"});
    EXPECT_EQ(0, cleared.exitCode) << cleared.err;
    EXPECT_EQ("", run({"read"}, {"--baud", "9600", uri}).err);
    EXPECT_EQ(kNothing, list());
}

TEST_F(OverrideTest, ThatKeepsThePortShutIsToldBeforeThat) {
    mrtu({"override", "set", "--sim", "--storage", storage_, "baud=150"});
    const Outcome outcome =
        mrtu({"read", "--port", "/dev/null", "--storage", storage_, "1?HREG?400001?unsignedShort"});
    EXPECT_NE(outcome.err.find("baud 150 instead of 19200"), std::string::npos) << outcome.err;
    EXPECT_LT(outcome.err.find("baud 150"), outcome.err.find("not a terminal")) << outcome.err;
}

TEST_F(OverrideTest, ThatSaysWhatTheConfigurationSaysIsNotWorthAWord) {
    set({"baud=38400", "parity=even"});
    EXPECT_EQ("", run({"read"}, {"--baud", "38400", "--parity", "EVEN", "1?OUTP?1?boolean"}).err);
}

TEST_F(OverrideTest, IsTheConsolesToo) {
    set({"node", "5=7"});
    EXPECT_EQ("id 5 -> 7\n", run({"console"}, {"getid"}).out);
    EXPECT_EQ("id 5 set to 9\n", run({"console"}, {"setid", "5", "9"}).out);
    EXPECT_NE(list().find("node 5 = 9 (stored)\n"), std::string::npos);
}

TEST_F(OverrideTest, BelongsToOneIdent) {
    set({"--ident", "left", "node", "5=7"});
    EXPECT_EQ(kNothing, list());
    EXPECT_EQ("id 5 -> 7\n", run({"console"}, {"--ident", "left", "getid"}).out);
}

TEST_F(OverrideTest, IsClearedOneByOne) {
    set({"node", "5=7", "6=off", "modicon", "5=off", "baud=38400", "parity=even"});
    const Outcome outcome = clear({"node", "5", "modicon", "5", "baud"});
    EXPECT_EQ("cleared\n", outcome.out);
    EXPECT_EQ(0, outcome.exitCode) << outcome.err;
    EXPECT_EQ(
        "node 1 = 1\nmodicon 1 = on\nnode 6 = off (stored)\nmodicon 6 = on\n"
        "baud = 19200\nparity = even (stored)\nstop = 1\nmode = RS-232\n",
        list());
}

TEST_F(OverrideTest, IsClearedAtOnceWithoutALine) {
    set({"node", "5=7", "modicon", "9=off", "mode=RS-485"});
    const Outcome outcome = mrtu({"override", "clear", "--storage", storage_, "all"});
    EXPECT_EQ("cleared\n", outcome.out);
    EXPECT_EQ(0, outcome.exitCode) << outcome.err;
    EXPECT_EQ(kNothing, list());
}

TEST_F(OverrideTest, AWrongWordChangesNothing) {
    for (const char* const wrong : {"baud=14400", "stop=7", "6=256", "nonsense"}) {
        const Outcome outcome = set({"node", "5=7", wrong});
        EXPECT_EQ(2, outcome.exitCode) << wrong;
        EXPECT_EQ("", outcome.out) << wrong;
        EXPECT_NE(outcome.err.find(wrong), std::string::npos) << outcome.err;
    }
    EXPECT_EQ(kNothing, list());
}

TEST_F(OverrideTest, WithoutAStorageItEndsWithItsCommand) {
    const Outcome outcome = mrtu({"override", "set", "--sim", "node", "5=7"});
    EXPECT_EQ("node 5 = 7\n", outcome.out);
    EXPECT_EQ("mrtu: there is no storage: the overrides end with this command\n", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
    EXPECT_EQ(2, mrtu({"override", "clear", "--sim", "all"}).exitCode);
}

TEST_F(OverrideTest, NeedsALine) {
    const Outcome outcome = mrtu({"override", "list", "--storage", "none"});
    EXPECT_EQ("mrtu: no line: --port com1=/dev/ttyUSB0, or --sim\n", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST_F(OverrideTest, AStorageThatMayNotBeWrittenIsAFailureAndKeepsItsValues) {
    set({"node", "5=7"});
    ASSERT_EQ(0, chmod(storage_.c_str(), 0444));
    const Outcome outcome = mrtu({"override", "set", "--sim", "--storage", storage_, "node", "5=9"},
                                 {.unprivileged = true});
    if (outcome.exitCode >= 126) GTEST_SKIP() << "the unprivileged user can't run the command";
    EXPECT_EQ(1, outcome.exitCode);
    EXPECT_EQ("node 5 = 9\n", outcome.out);
    EXPECT_NE(outcome.err.find("storage"), std::string::npos) << outcome.err;
    EXPECT_NE(list().find("node 5 = 7 (stored)\n"), std::string::npos);
}

}  // namespace
