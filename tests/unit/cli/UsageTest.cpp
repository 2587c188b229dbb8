// Command lines and configurations that are not accepted, and questions.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <sstream>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;

const std::string kUri = "1?HREG?400001?unsignedShort";

/// Each line of standard error is a complaint, and there is one.
void expectComplaints(const std::string& err) {
    std::istringstream lines(err);
    int count = 0;
    for (std::string line; std::getline(lines, line); ++count)
        EXPECT_EQ(0U, line.rfind("mrtu: ", 0)) << line;
    EXPECT_GT(count, 0);
}

TEST(UsageTest, WrongCommandLinesExitWithTwo) {
    const std::vector<std::string> rows[] = {
        {},
        {"nonsense"},
        {"read"},
        {"read", "--sim"},
        {"read", "--nonsense", kUri},
        {"read", kUri},
        {"read", "--sim", "--port", "com1=/dev/null", kUri},
        {"read", "--sim", "--port"},
        {"write", "--sim"},
        {"override"},
        {"override", "set", "--sim"},
        {"info", "more"},
        {"sim", "--node", "0"},
        {"sim", "--node", "248"},
        {"sim", "--node", "x"},
        {"sim", "--node", "1", "--node", "1"},
        {"sim", "--fault", "nonsense"},
        {"sim", "--baud", "0"},
        {"sim", "--parity", "even"},
        {"sim", "--turnaround", "fast"},
        {"sim", "--turnaround", "11:20"},
        {"sim", "--away", "0/0"},
        {"sim", "--dead", "11"},
        {"sim", "--refuse", "HREG"},
        {"sim", "--refuse", "11:HREG:1"},
    };
    for (const auto& words : rows) {
        const Outcome outcome = mrtu(words);
        const std::string last = words.empty() ? "nothing" : words.back();
        EXPECT_EQ(2, outcome.exitCode) << last;
        EXPECT_EQ("", outcome.out) << last;
        expectComplaints(outcome.err);
    }
}

TEST(UsageTest, WhatIsUnknownIsAnsweredWithWhatIsAccepted) {
    const struct {
        std::vector<std::string> words;
        const char* answer;
    } rows[] = {
        {{"reed", kUri},
         "unknown command: 'reed' is not one of read, write, console, override, info, describe, "
         "check, plan, poll, inspect, sim; did you mean 'read'?"},
        {{"override", "lst"},
         "unknown command: 'lst' is not one of list, set, clear; did you mean 'list'?"},
        {{"override"}, "one of list, set, clear must follow; 'mrtu override --help' tells more"},
        {{"read", "--bauds", "9600", kUri}, "unknown option '--bauds'; did you mean '--baud'?"},
        {{"read", "--bauds=9600", kUri}, "unknown option '--bauds'; did you mean '--baud'?"},
        {{"--verson"}, "unknown option '--verson'; did you mean '--version'?"},
        {{"sim", "--xyz"}, "unknown option '--xyz'; 'mrtu sim --help' tells more"},
        {{"read"}, "URI is required, or --tags FILE; 'mrtu read --help' tells more"},
        {{"info", "more"}, "'more' was not expected; 'mrtu info --help' tells more"},
        {{"describe", "modls"},
         "section: 'modls' is not one of models, memory, parameters, conversions; did you mean "
         "'models'?"},
        {{"read", "--sim", "--model", "9", kUri},
         "--model: '9' is not one of 1, 2, 3, 4; 'mrtu read --help' tells more"},
        {{"write", "--sim", "--parity", "evn", "x"},
         "--parity: 'evn' is not one of none, even, odd, mark; did you mean 'even'?"},
        {{"read", "--sim", "--baud", "9601", kUri},
         "--baud: '9601' is not one of 150, 300, 600, 1200, 2400, 4800, 9600, 19200, 38400, "
         "57600, 115200; did you mean '9600'?"},
        {{"read", "--sim", "--timeout", "-5", kUri},
         "--timeout: '-5' is no number from 0 to 3600000; 'mrtu read --help' tells more"},
        {{"read", "--config", "", kUri}, "--config: an empty word; 'mrtu read --help' tells more"},
    };
    for (const auto& row : rows) {
        const Outcome outcome = mrtu(row.words);
        EXPECT_EQ(std::string("mrtu: ") + row.answer + '\n', outcome.err);
        EXPECT_EQ("", outcome.out) << row.answer;
        EXPECT_EQ(2, outcome.exitCode) << row.answer;
    }
}

TEST(UsageTest, ShortFormsRefuseWhatTheDriverWouldTakeForSomethingElse) {
    for (const char* const option :
         {"--baud", "--parity", "--stopbits", "--node", "--model", "--timeout"}) {
        for (const char* const value : {"abc", "", "0x10", "999999999999", "-1"}) {
            const Outcome outcome = mrtu({"read", "--sim", option, value, kUri});
            EXPECT_EQ(2, outcome.exitCode) << option << ' ' << value;
            EXPECT_EQ(0U, outcome.err.rfind(std::string("mrtu: ") + option, 0)) << outcome.err;
        }
    }
    EXPECT_EQ(2, mrtu({"read", "--sim", "--baud", "0", kUri}).exitCode);
    // The driver alone would read 010 as 8.
    EXPECT_EQ("maxtm = 20 ms\n",
              mrtu({"console", "--timeout", "010", "--set", "repeat=2", "getmaxtm"}).out);
}

TEST(UsageTest, WithJsonEveryFailureIsJson) {
    const std::vector<std::string> rows[] = {
        {"read"},
        {"read", "--bogus", kUri},
        {"read", kUri},
        {"read", "--sim", "--config", "/nowhere/x.cfg", kUri},
        {"read", "--port", "/nowhere/tty", kUri},
        {"read", "--sim", "--plugin", "/nowhere/x.so", kUri},
        {"read", "--sim", "--storage", SOURCE_FOLDER "/README.md", kUri},
        {"read", "--sim", "1?HREG?400001?word", "1?HREG?410001?int"},
        {"write", "--sim", "x"},
        {"write", "--sim", "1?HREG?410001?short=1"},
        {"describe", "--plugin", "/nowhere/x.so"},
        {"describe", "modls"},
        {"check", "--config", "/nowhere/x.cfg"},
        {"inspect", "/nowhere/x.so"},
        {"inspect", "/dev/null"},
        {"info"},
        {"reed"},
        {},
    };
    for (std::vector<std::string> words : rows) {
        const std::string first = words.empty() ? "nothing" : words.front();
        words.push_back("--json");
        const Outcome outcome = mrtu(words);
        EXPECT_NE(outcome.exitCode, 0) << first;
        const auto document = nlohmann::json::parse(outcome.out, nullptr, false);
        EXPECT_FALSE(document.is_discarded()) << first << ": " << outcome.out;
        if (!document.is_object() || !document.contains("errors")) continue;
        EXPECT_EQ(outcome.exitCode, document["exitCode"]) << first;
        std::string complaints;
        for (const auto& each : document["errors"])
            complaints += "mrtu: " + each.get<std::string>() + '\n';
        EXPECT_EQ(outcome.err, complaints) << first;
        expectComplaints(outcome.err);
    }
}

TEST(UsageTest, EveryCommandThatIsOfferedStandsInTheHelp) {
    const std::string help = mrtu({"--help"}).out;
    std::string names = mrtu({"reed"}).err;
    names = names.substr(names.find("one of ") + 7);
    names = names.substr(0, names.find(';'));
    std::istringstream words(names);
    int count = 0;
    for (std::string name; words >> name; ++count) {
        if (name.ends_with(',')) name.pop_back();
        EXPECT_NE(std::string::npos, help.find("\n  " + name + ' ')) << name;
    }
    EXPECT_EQ(11, count);
}

TEST(UsageTest, EveryCommandExplainsItselfWithExamples) {
    for (const char* const command : {"read", "write", "console", "override", "info", "describe",
                                      "check", "plan", "inspect", "sim"}) {
        const Outcome outcome = mrtu({command, "--help"});
        EXPECT_EQ(0, outcome.exitCode) << command;
        EXPECT_NE(outcome.out.find("Examples:\n  mrtu " + std::string(command)), std::string::npos)
            << outcome.out;
    }
    const Outcome outcome = mrtu({"--help"});
    EXPECT_EQ(0, outcome.exitCode);
    EXPECT_NE(outcome.out.find("Exit codes:"), std::string::npos);
}

TEST(UsageTest, VersionIsTheProjects) {
    const Outcome outcome = mrtu({"--version"});
    EXPECT_EQ("mrtu " MRTU_VERSION "\n", outcome.out);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(UsageTest, ConfigurationThatTheDriverRefusesIsAUsageError) {
    const struct {
        const char* text;
        const char* complaint;
    } rows[] = {
        {"timeout=1", "Parser: unknown format"},
        {"CfgVer=1 uart=com1", "Parser: parameter 'defNodeId' is not found"},
        {"CfgVer=1 defNodeId=1", "Parser: parameter 'uart' is not found"},
        {"CfgVer=1 defNodeId=1 txMode=RTU uart=com1 baudrate=9600 parity=both stopbits=1 "
         "mode=RS-232",
         "Parser: parameter 'parity' has invalid value"},
        {"CfgVer=1 defNodeId=1 txMode=RTU uart=com1 baudrate=9600 parity=none stopbits=1 "
         "mode=rs-485",
         "Parser: parameter 'mode' has invalid value"},
        {"CfgVer=1 defNodeId=1 maxOptLen=-1", "parameter 'maxOptLen' out of range"},
    };
    const std::string file = cli_test::scratchFile("bad.cfg");
    for (const auto& row : rows) {
        cli_test::writeFile(file, row.text);
        const Outcome outcome = mrtu({"read", "--sim", "--config", file, kUri});
        EXPECT_EQ("mrtu: configuration: " + std::string(row.complaint) + "\n", outcome.err);
        EXPECT_EQ(2, outcome.exitCode) << row.text;
    }
}

TEST(UsageTest, ConfigurationThatCannotBeReadIsAUsageError) {
    const std::string missing = cli_test::scratchFolder() + "/none.cfg";
    const Outcome outcome = mrtu({"read", "--sim", "--config", missing, kUri});
    EXPECT_EQ("mrtu: configuration " + missing + ": No such file or directory\n", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(UsageTest, InfoTellsWhatTheDriverSaysOfItself) {
    const Outcome outcome = mrtu({"info", "--plugin", MRTU_PLUGIN});
    EXPECT_EQ("plug-in        " MRTU_PLUGIN
              "\n"
              "name           MRTU\n"
              "display name   Modbus RTU\n"
              "type           184\n"
              "version        126\n"
              "implementation Protocol_MRTU v.100\n"
              "generation     IProtocol7\n"
              "description    compressedXML=2224\n"
              "\n"
              "Protocol: MRTU (184) v.126\n"
              "Implementation: Protocol_MRTU v.100\n"
              "ProtocolBase v.100\n"
              "ProtLib v.200\n"
              "runtime::PosixMultiTask v.100\n"
              "runtime::PosixSerialFactory v.100\n"
              "runtime::Sockets v.100\n",
              outcome.out);
    EXPECT_EQ(0, outcome.exitCode) << outcome.err;
}

}  // namespace
