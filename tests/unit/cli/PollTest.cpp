// `mrtu poll` as its users run it.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "tests/unit/cli/Child.h"
#include "values/JsonValues.h"

namespace {

using cli_test::contentsOf;
using cli_test::mrtu;
using cli_test::RunningSim;
using cli_test::scratchFile;
using cli_test::TerminalSession;
using cli_test::writeFile;
using values::Json;

constexpr const char* kTags =
    "name,uri,unit,scale,decimals,period\n"
    "Level,1?HREG?400001?unsignedShort,m,0.1,1,20\n"
    "Pump,1?OUTP?1?boolean,,,,20\n";

class PollTest : public testing::Test {
  protected:
    void SetUp() override { writeFile(tags_, kTags); }
    std::vector<std::string> simulated(const std::vector<std::string>& more) const {
        std::vector<std::string> words{"poll", "--sim", "--tags", tags_};
        words.insert(words.end(), more.begin(), more.end());
        return words;
    }

    std::string tags_ = scratchFile("poll.csv");
};

std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

TEST_F(PollTest, ReadsEachTagOnceAsCsv) {
    const auto outcome = mrtu(simulated({"--once"}));
    EXPECT_EQ(0, outcome.exitCode);
    EXPECT_EQ("", outcome.err);
    const auto lines = linesOf(outcome.out);
    ASSERT_EQ(3U, lines.size());
    EXPECT_EQ("time,name,value,unit,quality,code,error", lines[0]);
    EXPECT_EQ("Z,Level,100.0,m,good,,", lines[1].substr(lines[1].find("Z,")));
    EXPECT_EQ("Z,Pump,0,,good,,", lines[2].substr(lines[2].find("Z,")));
}

TEST_F(PollTest, WritesOneDocumentALineAndItsStatisticsElsewhere) {
    const auto outcome = mrtu(simulated({"--json", "--count", "3"}));
    EXPECT_EQ(0, outcome.exitCode);
    const auto lines = linesOf(outcome.out);
    ASSERT_LE(2U, lines.size());
    for (const std::string& line : lines)
        EXPECT_EQ("good", Json::parse(line)["quality"]);
    EXPECT_NE(std::string::npos, outcome.err.find("node 1 ok")) << outcome.err;
    EXPECT_NE(std::string::npos, outcome.err.find("cycles 3")) << outcome.err;
}

TEST_F(PollTest, HasTheExitCodesOfRead) {
    const std::vector<std::string> patience{"--once", "--timeout", "50", "--set", "repeat=0"};
    writeFile(tags_, "99?HREG?400001?unsignedShort\n1?HREG?400001?unsignedShort\n");
    const auto silent = mrtu(simulated(patience));
    EXPECT_EQ(4, silent.exitCode);
    EXPECT_NE(std::string::npos, silent.out.find("1?HREG?400001?unsignedShort,1000,,good"))
        << "one that fails does not stop the others";
    writeFile(tags_, "1?HREG?465000?unsignedShort\n");
    EXPECT_EQ(5, mrtu(simulated(patience)).exitCode);
    EXPECT_EQ(3, mrtu({"poll", "--port", "/dev/no-such-port", "--tags", tags_, "--once"}).exitCode);
    EXPECT_EQ(2, mrtu({"poll", "--tags", tags_, "--once"}).exitCode) << "no line";
    EXPECT_EQ(2, mrtu({"poll", "--sim"}).exitCode) << "no list";
}

TEST_F(PollTest, RefusesAListThatCanNotBePolled) {
    struct Row {
        const char* list;
        const char* complaint;
    };
    for (const Row& row : {Row{"", ":1:1: "}, Row{"name,uri\n", ": "},
                           Row{"name,uri,period\na,1?HREG?400001?unsignedShort,0\n", ":2:"},
                           Row{"name,uri\na,1?NOPE?1?int\n", ":2:3: 1?NOPE?1?int: error -1: "}}) {
        writeFile(tags_, row.list);
        const auto outcome = mrtu(simulated({"--once"}));
        EXPECT_EQ(2, outcome.exitCode) << row.list;
        EXPECT_EQ("", outcome.out) << row.list;
        EXPECT_NE(std::string::npos, outcome.err.find(tags_ + row.complaint)) << outcome.err;
    }
    const auto json = mrtu(simulated({"--json"}));
    EXPECT_EQ(Json(2), Json::parse(json.out)["exitCode"]);
}

TEST_F(PollTest, RefusesPeriodsOfNothing) {
    for (const char* interval : {"0", "-1", "x"})
        EXPECT_EQ(2, mrtu(simulated({"--once", "--interval", interval})).exitCode);
}

TEST_F(PollTest, TakesAListOfAHundredThousandTags) {
    std::string list = "name,uri\n";
    for (int i = 0; i < 100000; ++i) {
        list += "tag" + std::to_string(i) + ',' + std::to_string(1 + i % 2) + "?HREG?" +
                std::to_string(400001 + i / 2 % 100) + "?unsignedShort\n";
    }
    writeFile(tags_, list);
    const auto outcome = mrtu(simulated({"--once"}));
    EXPECT_EQ(0, outcome.exitCode) << outcome.err.substr(0, 500);
    EXPECT_EQ(100001U, linesOf(outcome.out).size());
}

TEST_F(PollTest, EndsQuietlyWhenNobodyReadsAnyMore) {
    const std::string code = scratchFile("code");
    const std::string err = scratchFile("err");
    const std::string out = scratchFile("out");
    const std::string command = "{ " MRTU_BINARY " poll --sim --interval 20 --tags " + tags_ +
                                " 2>" + err + "; echo $? >" + code + "; } | head -2 >" + out;
    ASSERT_EQ(0, std::system(command.c_str()));
    EXPECT_EQ("0\n", contentsOf(code));
    EXPECT_EQ(2U, linesOf(contentsOf(out)).size());
    EXPECT_EQ("node 1 ok", contentsOf(err).substr(0, 9)) << "statistics and no complaint";
}

TEST_F(PollTest, ComplainsOfAnOutputThatCanNotBeWritten) {
    EXPECT_EQ(1, mrtu(simulated({}), {.outFile = "/dev/full"}).exitCode);
}

TEST_F(PollTest, EndSignalsPrintTheStatistics) {
    for (const int signal : {SIGINT, SIGTERM}) {
        TerminalSession poll(simulated({"--csv"}));
        ASSERT_TRUE(poll.shows("Pump"));
        poll.send(signal);
        EXPECT_TRUE(poll.shows("node 1 ok"));
        EXPECT_EQ(0, poll.end());
    }
}

TEST_F(PollTest, DrawsATableAndGivesTheTerminalBack) {
    TerminalSession poll(simulated({}), "xterm");
    const termios before = poll.settings();
    ASSERT_TRUE(poll.shows("2 good"));
    poll.type("/level\r");
    ASSERT_TRUE(poll.shows("/level"));
    poll.resize(20, 6);
    ASSERT_TRUE(poll.shows("\x1B[2J")) << "another size begins anew";
    poll.type("q");
    ASSERT_TRUE(poll.shows("\x1B[?1049l"));
    EXPECT_TRUE(poll.shows("node 1 ok"));
    EXPECT_EQ(0, poll.end());
    EXPECT_EQ(before.c_lflag, poll.settings().c_lflag);
}

TEST_F(PollTest, GivesTheTerminalBackWhenASignalEndsIt) {
    TerminalSession poll(simulated({}), "xterm");
    const termios before = poll.settings();
    ASSERT_TRUE(poll.shows("2 good"));
    poll.send(SIGTERM);
    EXPECT_TRUE(poll.shows("\x1B[?1049l"));
    EXPECT_EQ(0, poll.end());
    EXPECT_EQ(before.c_lflag, poll.settings().c_lflag);
}

TEST_F(PollTest, TakesChangedFilesAndKeepsThePlanWhenTheyAreWrong) {
    TerminalSession poll(simulated({"--csv"}));
    ASSERT_TRUE(poll.shows("Pump"));
    writeFile(tags_, std::string(kTags) + "Valve,1?OUTP?2?boolean,,,,20\n");
    poll.send(SIGHUP);
    EXPECT_TRUE(poll.shows("Valve,"));
    writeFile(tags_, "name,uri\nx\n");
    poll.send(SIGHUP);
    EXPECT_TRUE(poll.shows("the plan in force stays"));
    std::filesystem::remove(tags_);
    poll.send(SIGHUP);
    EXPECT_TRUE(poll.shows("No such file or directory; the plan in force stays"));
    writeFile(tags_, "name,uri,period\nOther,1?OUTP?3?boolean,20\n");
    EXPECT_TRUE(poll.shows("Other,")) << "seen without a signal";
    poll.send(SIGINT);
    EXPECT_EQ(0, poll.end());
}

TEST_F(PollTest, GoesOnWhenThePortIsPulledAndPutBack) {
    const std::string link = scratchFile("line");
    auto sim = std::make_unique<RunningSim>(std::vector<std::string>{"--link", link});
    TerminalSession poll({"poll", "--port", link, "--csv", "--timeout", "100", "--tags", tags_});
    ASSERT_TRUE(poll.shows("Level,100.0,m,good"));
    EXPECT_EQ(0, sim->end(SIGTERM));
    ASSERT_TRUE(poll.shows("Level,100.0,m,stale"));
    sim = std::make_unique<RunningSim>(std::vector<std::string>{"--link", link});
    EXPECT_TRUE(poll.shows("Level,100.0,m,good"));
    poll.send(SIGTERM);
    EXPECT_EQ(0, poll.end());
}

}  // namespace
