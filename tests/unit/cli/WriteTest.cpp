// mrtu write: all values are looked at first; what is written can be read back.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;
using cli_test::RunningSim;

bool sentAnything(const Outcome& outcome) {
    return outcome.err.find(" > ") != std::string::npos;
}

TEST(WriteTest, EveryTypeIsReadBackAsItWasWritten) {
    const std::vector<std::string> assignments{
        "1?OUTP?1?boolean=1",
        "1?OUTP?9?boolean-10=1,0,1,1,0,0,1,1,1,0",
        "1?HREG?400001?byte=-128",
        "1?HREG?400002?short=-32768",
        "1?HREG?400003?int=-2147483648",
        "1?HREG?400005?unsignedByte=255",
        "1?HREG?400006?unsignedShort=65535",
        "1?HREG?400007?unsignedInt=4294967295",
        "1?HREG?400009?float=-0.1",
        "1?HREG?400011?double=1.7976931348623157e+308",
        "1?HREG?400015?string-9=\"Pump \\\"1\\\"\"",
        "1?HREG?400020?binary-3=0x0102ff",
        "1?HREG?400022.15?boolean=1",
        "1?HREG?400023?boolean-20=1,1,1,1,0,0,0,0,1,0,1,0,1,0,1,0,1,1,0,1",
        "1?HREG?400026?byte-3=-1,0,1",
        "1?HREG?400028?short-2=-1,1",
        "1?HREG?400030?int-2=-1,1",
        "1?HREG?400034?unsignedByte-3=1,2,255",
        "1?HREG?400036?unsignedShort-2=1,65535",
        "1?HREG?400038?unsignedInt-2=1,4294967295",
        "1?HREG?400042?float-2=1.5,nan",
        "1?HREG?400046?double-2=0.1,-inf",
        "1?HREG?400054?uint64=18446744073709551615",
        "1?HREG?400058?int64=-9223372036854775808",
        "1?HREG?400062?uint64-1=1",
        "1?HREG?400066?int64-2=-1,1",
        "1?LONG?5000?unsignedInt=305419896",
        "1?LONG?5001?float=2.5",
    };
    std::vector<std::string> words{"write", "--sim", "--verify"};
    words.insert(words.end(), assignments.begin(), assignments.end());
    const Outcome outcome = mrtu(words);
    std::string expected;
    for (const std::string& assignment : assignments) {
        const std::size_t equals = assignment.find('=');
        expected += assignment.substr(0, equals) + " = " + assignment.substr(equals + 1) + '\n';
    }
    EXPECT_EQ(expected, outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(WriteTest, TheDeviceHoldsItAfterwards) {
    const RunningSim sim({});
    const Outcome written = mrtu(
        {"write", "--port", sim.device(), "1?HREG?400001?short=0x7f", "1?OUTP?1?boolean=true"});
    EXPECT_EQ("1?HREG?400001?short = 127\n1?OUTP?1?boolean = 1\n", written.out);
    EXPECT_EQ(0, written.exitCode) << written.err;
    const Outcome read =
        mrtu({"read", "--port", sim.device(), "1?HREG?400001?short", "1?OUTP?1?boolean"});
    EXPECT_EQ("1?HREG?400001?short = 127\n1?OUTP?1?boolean = 1\n", read.out) << read.err;
}

TEST(WriteTest, OneWrongAssignmentAndNothingIsSent) {
    const std::string good = "1?HREG?400001?short=1";
    const struct {
        const char* wrong;
        const char* complaint;
    } rows[] = {
        {"1?HREG?400002?short=70000",
         "mrtu: 1?HREG?400002?short: '70000' is out of range for short (-32768..32767)\n"},
        {"1?HREG?400002?short-2=1", "mrtu: 1?HREG?400002?short-2: short-2 needs 2 items, not 1\n"},
        {"1?HREG?400002?float=x", "mrtu: 1?HREG?400002?float: 'x' is no number for float\n"},
        {"1?INP?100001?boolean=1", "mrtu: 1?INP?100001?boolean: can only be read\n"},
        {"1?IREG?300001?short=1", "mrtu: 1?IREG?300001?short: can only be read\n"},
        {"1?HREG?400002?short", "mrtu: '1?HREG?400002?short' is no URI=VALUE\n"},
        {"1?HREG?400002=1",
         "mrtu: 1?HREG?400002: Tag URI error: 1?HREG?400002 - there must be 4 tag "
         "specification fields\n"},
    };
    for (const auto& row : rows) {
        const Outcome outcome = mrtu({"write", "--sim", "--trace", good, row.wrong});
        EXPECT_EQ(std::string(row.complaint) + "mrtu: nothing was sent\n", outcome.err);
        EXPECT_EQ("", outcome.out) << row.wrong;
        EXPECT_EQ(2, outcome.exitCode) << row.wrong;
    }
    EXPECT_TRUE(sentAnything(mrtu({"write", "--sim", "--trace", good})));
}

TEST(WriteTest, AFailureDoesNotStopTheOthers) {
    const Outcome outcome =
        mrtu({"write", "--sim", "--timeout", "100", "--set", "repeat=0", "1?HREG?410001?short=1",
              "77?HREG?400001?short=1", "1?HREG?400001?short=1"});
    EXPECT_EQ("1?HREG?400001?short = 1\n", outcome.out);
    EXPECT_EQ(
        "mrtu: 1?HREG?410001?short: error -6: Exception: Illegal data address\n"
        "mrtu: 77?HREG?400001?short: error -4: No response\n",
        outcome.err);
    EXPECT_EQ(5, outcome.exitCode);
}

TEST(WriteTest, VerifyNoticesADeviceThatHoldsSomethingElse) {
    // The first answer, the acknowledgement, is only late; the second tells of a 6.
    const RunningSim sim({"--fault", "delay=1", "--fault", "send=01030200063846"});
    const Outcome outcome =
        mrtu({"write", "--port", sim.device(), "--verify", "1?HREG?400001?short=5"});
    EXPECT_EQ("mrtu: 1?HREG?400001?short: error 0: wrote 5 but read back 6\n", outcome.err);
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(1, outcome.exitCode);
}

TEST(WriteTest, TheConfiguredFunctionIsUsed) {
    const Outcome outcome =
        mrtu({"write", "--sim", "--trace", "--set", "presetFunction=06", "1?HREG?400001?short=7"});
    EXPECT_NE(outcome.err.find(" com1 > 01 06 00 00 00 07 C8 08\n"), std::string::npos)
        << outcome.err;
    EXPECT_EQ(0, outcome.exitCode);
}

// Function 5 writes one coil, and of an array the driver sends each the first eight's values.
TEST(WriteTest, AnArrayOfCoilsGoesCoilByCoilWithFunctionFive) {
    const RunningSim sim({});
    for (const char* const key : {"forceFunction=05", "Node1::forceFunction=5"}) {
        const Outcome written = mrtu({"write", "--port", sim.device(), "--trace", "--set", key,
                                      "1?OUTP?6?boolean-12=1,0,1,1,0,1,1,0,0,1,0,1"});
        EXPECT_EQ(0, written.exitCode) << written.err;
        EXPECT_NE(written.err.find(" com1 > 01 05 00 10 FF 00 "), std::string::npos) << written.err;
        const Outcome read = mrtu({"read", "--port", sim.device(), "1?OUTP?6?boolean-12"});
        EXPECT_EQ("1?OUTP?6?boolean-12 = 1,0,1,1,0,1,1,0,0,1,0,1\n", read.out) << key;
        mrtu({"write", "--port", sim.device(), "1?OUTP?6?boolean-12=0,0,0,0,0,0,0,0,0,0,0,0"});
    }
}

TEST(WriteTest, AnArrayThatBreaksOffTellsWhatWasWritten) {
    const Outcome outcome = mrtu({"write", "--sim", "--set", "forceFunction=05",
                                  "1?OUTP?9999?boolean-4=1,1,1,1", "1?OUTP?10001?boolean-2=1,1"});
    EXPECT_EQ(
        "mrtu: 1?OUTP?9999?boolean-4: error -6: Exception: Illegal data address (the first 2 "
        "coils were written)\n"
        "mrtu: 1?OUTP?10001?boolean-2: error -6: Exception: Illegal data address\n",
        outcome.err);
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(5, outcome.exitCode);
}

const std::vector<std::string> kBriefly{"write", "--sim", "--timeout", "20", "--set", "repeat=0"};

TEST(WriteTest, ABroadcastExpectsNoAnswer) {
    std::vector<std::string> words = kBriefly;
    words.push_back("0?HREG?400001?short=5");
    const Outcome text = mrtu(words);
    EXPECT_EQ("0?HREG?400001?short = 5\n", text.out);
    EXPECT_EQ("mrtu: 0?HREG?400001?short: a broadcast: no answer is expected\n", text.err);
    EXPECT_EQ(0, text.exitCode);
    words.push_back("--json");
    EXPECT_EQ(nlohmann::json::parse(R"([{"uri": "0?HREG?400001?short", "type": "short", "value": 5,
                                         "broadcast": true}])"),
              nlohmann::json::parse(mrtu(words).out));
    words.push_back("--verify");
    const Outcome verified = mrtu(words);
    EXPECT_EQ(2, verified.exitCode);
    EXPECT_NE(verified.err.find("a broadcast can't be read back"), std::string::npos)
        << verified.err;
}

// Nobody answers its first request, so the driver never sends the second.
TEST(WriteTest, ABroadcastOfSeveralRequestsIsRefused) {
    const struct {
        std::vector<std::string> options;
        const char* assignment;
        int exitCode;
    } rows[] = {
        {{}, "0?HREG?400001?int=1", 0},
        {{"--set", "presetFunction=06"}, "0?HREG?400001?short=1", 0},
        {{"--set", "presetFunction=06"}, "0?HREG?400001?int=1", 2},
        {{"--set", "Node0::maxOptLen=4"}, "0?HREG?400001?short-3=1,2,3", 2},
        {{}, "0?OUTP?1?boolean-3=1,1,0", 0},
        {{"--set", "forceFunction=05"}, "0?OUTP?1?boolean=1", 0},
        {{"--set", "forceFunction=05"}, "0?OUTP?1?boolean-3=1,1,0", 2},
        {{}, "0?LONG?5000?int=1", 0},
        {{}, "0?LONG?5000?int-2=1,2", 2},
    };
    for (const auto& row : rows) {
        std::vector<std::string> words = kBriefly;
        words.insert(words.end(), row.options.begin(), row.options.end());
        words.push_back(row.assignment);
        const Outcome outcome = mrtu(words);
        EXPECT_EQ(row.exitCode, outcome.exitCode) << row.assignment << outcome.err;
        if (row.exitCode == 0) continue;
        EXPECT_NE(outcome.err.find("a broadcast must fit into one request"), std::string::npos)
            << outcome.err;
    }
}

TEST(WriteTest, AnOverrideToZeroMakesABroadcastOfIt) {
    const std::string storage = cli_test::scratchFile("broadcast.db");
    mrtu({"override", "set", "--sim", "--storage", storage, "node", "5=0"});
    std::vector<std::string> words = kBriefly;
    words.insert(words.end(), {"--storage", storage, "5?HREG?400001?short=5"});
    const Outcome outcome = mrtu(words);
    EXPECT_EQ("5?HREG?400001?short = 5\n", outcome.out);
    EXPECT_NE(outcome.err.find("a broadcast: no answer is expected\n"), std::string::npos);
    words.push_back("5?HREG?400001?short-200=1" + [] {
        std::string more;
        for (int i = 1; i < 200; ++i)
            more += ",1";
        return more;
    }());
    const Outcome tooLong = mrtu(words);
    EXPECT_EQ(4, tooLong.exitCode);
    EXPECT_NE(tooLong.err.find("short-200: error -4: No response\n"), std::string::npos);
    words.push_back("--verify");
    EXPECT_EQ(4, mrtu(words).exitCode);
}

TEST(WriteTest, WhatIsRefusedIsJsonToo) {
    const Outcome outcome = mrtu({"write", "--sim", "--json", "1?HREG?400002?short=x"});
    const auto document = nlohmann::json::parse(outcome.out);
    EXPECT_EQ(2, document["exitCode"]);
    EXPECT_EQ((std::vector<std::string>{"1?HREG?400002?short: 'x' is no whole number (short)",
                                        "nothing was sent"}),
              document["errors"]);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(WriteTest, AValueThatTheDriversOwnAreaRefusesIsAFailure) {
    const Outcome outcome = mrtu({"write", "--sim", "1?SP_Stop?0?unsignedByte=7"});
    EXPECT_EQ("mrtu: 1?SP_Stop?0?unsignedByte: error 1: refused\n", outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(WriteTest, JsonTellsWhatWasWritten) {
    const Outcome outcome = mrtu({"write", "--sim", "--json", "1?HREG?400001?short=-5"});
    EXPECT_EQ(
        nlohmann::json::parse(R"([{"uri": "1?HREG?400001?short", "type": "short", "value": -5}])"),
        nlohmann::json::parse(outcome.out));
    EXPECT_EQ(0, outcome.exitCode);
}

}  // namespace
