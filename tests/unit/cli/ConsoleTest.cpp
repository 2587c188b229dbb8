// mrtu console: answers as the driver gives them.
#include <gtest/gtest.h>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;

constexpr const char* kHelp =
    "help - displays this message\n"
    "info - displays information about the protocol version\n"
    "xml  - displays the protocol xml description\n"
    "read uri - reads data pointed by uri string\n"
    "write uri hexData - writes data pointed by uri string\n"
    "lasterror - displays the last protocol error\n"
    "getmaxtm - displays the max time for executing a single read/write access\n"
    "setid n m - set the node id n to m\n"
    "getid - get all changed node id's\n";

TEST(ConsoleTest, OneCommandIsAnsweredAsTheDriverAnswers) {
    const struct {
        std::vector<std::string> words;
        const char* answer;
        int exitCode = 0;
    } rows[] = {
        {{"help"}, kHelp},
        {{"getmaxtm"}, "maxtm = 4000 ms\n"},
        {{"xml"}, "compressedXML=2224"},
        {{"read", "1?HREG?400001?short"}, "e803\n"},
        {{"read"}, "error: missing parameter (URI string)\n", 2},
        {{"write", "1?HREG?400001?short", "0102"}, "written ok\n"},
        {{"write", "1?HREG?400001?short", "001"}, "error: incorrect length of data to write\n", 2},
        {{"write", "1?HREG?400001?short", "0g00"}, "error: incorrect hex data\n", 2},
        {{"read", "1?HREG?400001"},
         "Tag URI error: 1?HREG?400001 - there must be 4 tag specification fields",
         2},
        {{"read", "1?HREG?410001?short"}, "Exception: Illegal data address", 5},
        {{"read", "1?HREG?400001?int@ABCD"}, "e903e803\n"},
        {{"write", "1?HREG?400001?int@ABCD", "01000000"}, "written ok\n"},
        {{"setid", "5", "7"}, "id 5 set to 7\n"},
        {{"setid", "5"}, "invalid format\n", 2},
        {{"getid"}, "no node configurated\n"},
        {{"read 1?HREG?400001?short"}, "e803\n"},  // one word for the shell, two for the driver
    };
    for (const auto& row : rows) {
        std::vector<std::string> words{"console", "--sim"};
        words.insert(words.end(), row.words.begin(), row.words.end());
        const Outcome outcome = mrtu(words);
        EXPECT_EQ(row.answer, outcome.out);
        EXPECT_EQ("", outcome.err) << row.answer;
        EXPECT_EQ(row.exitCode, outcome.exitCode) << row.answer;
    }
}

TEST(ConsoleTest, ASilentDeviceIsAFailure) {
    const Outcome outcome = mrtu({"console", "--sim", "--timeout", "50", "--set", "repeat=0",
                                  "read", "77?HREG?400001?short"});
    EXPECT_EQ("No response", outcome.out);
    EXPECT_EQ(4, outcome.exitCode);
}

TEST(ConsoleTest, AWrongByteOrderIsAUsageError) {
    const Outcome outcome =
        mrtu({"console", "--sim"}, {.input = "read 1?HREG?400001?int@ABDC\ngetmaxtm\n"});
    EXPECT_EQ("mrtu: 'ABDC' is no byte order of int: ABCD, CDAB, DCBA, BADC\n", outcome.err);
    EXPECT_EQ("maxtm = 4000 ms\n", outcome.out);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(ConsoleTest, AnUnknownCommandIsAUsageError) {
    const Outcome outcome = mrtu({"console", "--sim", "HELP"});
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ("mrtu: unknown command 'HELP'; did you mean 'help'?\n", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(ConsoleTest, WithoutALineTheDriverStaysStopped) {
    EXPECT_EQ(kHelp, mrtu({"console", "help"}).out);
    const Outcome outcome = mrtu({"console", "read", "1?HREG?400001?short"});
    EXPECT_EQ("Protocol not started", outcome.out);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(ConsoleTest, PipedCommandsAreAnsweredLineByLine) {
    const Outcome outcome = mrtu({"console", "--sim"},
                                 {.input = "getmaxtm\n\nread x\r\nsetid 5 7\ngetid\nquit\nhelp\n"});
    EXPECT_EQ(
        "maxtm = 4000 ms\n"
        "Tag URI error: x - there must be 4 tag specification fields\n"
        "id 5 set to 7\n"
        "id 5 -> 7\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);  // of "read x"
}

TEST(ConsoleTest, AnUnknownPipedCommandDoesNotStopTheOthers) {
    const Outcome outcome = mrtu({"console", "--sim"}, {.input = "nonsense\ngetmaxtm"});
    EXPECT_EQ("maxtm = 4000 ms\n", outcome.out);
    EXPECT_EQ("mrtu: unknown command 'nonsense'\n", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(ConsoleTest, LongAnswersAreCutAtSixteenKibibytes) {
    const Outcome outcome = mrtu({"console", "--sim", "read", "1?HREG?400001?unsignedShort-5000"});
    // The driver leaves room for a line end and a zero behind the last whole byte.
    EXPECT_EQ(16 * 1024 - 3U, outcome.out.size());
    EXPECT_EQ("e803e903", outcome.out.substr(0, 8));
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ConsoleTest, AtATerminalLinesAreRemembered) {
    cli_test::TerminalSession session({"console", "--sim"});
    ASSERT_TRUE(session.shows("mrtu> ")) << session.screen();
    session.type("getmaxtm\r");
    ASSERT_TRUE(session.shows("maxtm = 4000 ms")) << session.screen();
    ASSERT_TRUE(session.shows("mrtu> ")) << session.screen();
    session.type("\x10\r");  // Ctrl-P: the line before
    ASSERT_TRUE(session.shows("maxtm = 4000 ms")) << session.screen();
    session.type("nonsense\r");
    ASSERT_TRUE(session.shows("unknown command 'nonsense'")) << session.screen();
    session.type("quit\r");
    EXPECT_EQ(0, session.end()) << session.screen();
}

}  // namespace
