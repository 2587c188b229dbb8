// mrtu read: values of every area, failures and what they make of the exit code.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;
using testing::Test;

/// The words of a read, common ones in front.
Outcome readWith(std::vector<std::string> options, const std::vector<std::string>& uris) {
    options.insert(options.begin(), "read");
    options.insert(options.end(), uris.begin(), uris.end());
    return mrtu(options);
}

const std::vector<std::string> kEveryArea{
    "1?OUTP?1?boolean-8",       "1?INP?100001?boolean",     "1?HREG?400001?unsignedShort",
    "1?IREG?300001?short-2",    "1?LONG?5000?unsignedInt",  "1?NO?0?unsignedByte",
    "1?NP_Mode?0?boolean",      "1?SP_Baud?0?unsignedInt",  "1?SP_Par?0?unsignedByte",
    "1?SP_Stop?0?unsignedByte", "1?SP_Mode?0?unsignedByte", "1?SP_Done?0?boolean",
    "2?HREG?400010.3?boolean"};

/// What sim/Memory.h lays down, worked out by hand.
constexpr const char* kEveryAreaText =
    "1?OUTP?1?boolean-8 = 0,0,1,0,0,1,0,0\n"
    "1?INP?100001?boolean = 1\n"
    "1?HREG?400001?unsignedShort = 1000\n"
    "1?IREG?300001?short-2 = 31000,31001\n"
    "1?LONG?5000?unsignedInt = 600018000\n"
    "1?NO?0?unsignedByte = 1\n"
    "1?NP_Mode?0?boolean = 1\n"
    "1?SP_Baud?0?unsignedInt = 19200\n"
    "1?SP_Par?0?unsignedByte = 0\n"
    "1?SP_Stop?0?unsignedByte = 1\n"
    "1?SP_Mode?0?unsignedByte = 0\n"
    "1?SP_Done?0?boolean = 0\n"
    "2?HREG?400010.3?boolean = 1\n";  // 2009 is 0x7D9

TEST(ReadTest, EveryAreaOfTheSimulatedLine) {
    const Outcome outcome = readWith({"--sim"}, kEveryArea);
    EXPECT_EQ(kEveryAreaText, outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ReadTest, TheSameInAsciiFrames) {
    const Outcome outcome = readWith({"--sim", "--ascii"}, kEveryArea);
    EXPECT_EQ(kEveryAreaText, outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ReadTest, TheSimulatorFollowsTheConfigurationFile) {
    const std::string file = cli_test::scratchFile("line.cfg");
    cli_test::writeFile(file,
                        "CfgVer=1 defNodeId=20 model=2 txMode=ASCII uart=com3 baudrate=9600\n"
                        "parity=even bits=7 stopbits=1 mode=RS-485 Node30::model=3\n");
    const Outcome outcome = readWith({"--sim", "--config", file},
                                     {"20?HREG?400000?unsignedShort", "30?LONG?5001?unsignedInt"});
    EXPECT_EQ(
        "20?HREG?400000?unsignedShort = 20000\n"
        "30?LONG?5001?unsignedInt = 3500205003\n",
        outcome.out);  // 100003 x 35001
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ReadTest, ArraysLongerThanARequestComeWhole) {
    const Outcome outcome = readWith({"--sim"}, {"1?HREG?400001?unsignedShort-300"});
    std::string expected = "1?HREG?400001?unsignedShort-300 = 1000";
    for (int i = 1; i < 300; ++i)
        expected.append(",").append(std::to_string(1000 + i));
    EXPECT_EQ(expected + "\n", outcome.out);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ReadTest, FloatsAreShortAndExact) {
    // Registers 1009 and 1010 of node 1: 0x03F1 and 0x03F2, low word first.
    const Outcome outcome = readWith({"--sim"}, {"1?HREG?400010?float"});
    EXPECT_EQ("1?HREG?400010?float = 1.42243865e-36\n", outcome.out);
}

TEST(ReadTest, AByteOrderCanBeNamed) {
    // Registers 1000 to 1003 of node 1: 0x03E8 to 0x03EB.
    const Outcome outcome =
        readWith({"--sim"}, {"1?HREG?400001?unsignedInt@ABCD", "1?HREG?400001?unsignedInt@CDAB",
                             "1?HREG?400001?unsignedInt@DCBA", "1?HREG?400001?unsignedInt@BADC",
                             "1?HREG?400001?uint64@ABCDEFGH", "1?HREG?400001?string-4@AB",
                             "1?LONG?5000?unsignedInt@ABCD"});
    EXPECT_EQ(
        "1?HREG?400001?unsignedInt@ABCD = 65537001\n"
        "1?HREG?400001?unsignedInt@CDAB = 65602536\n"
        "1?HREG?400001?unsignedInt@DCBA = 3909347331\n"
        "1?HREG?400001?unsignedInt@BADC = 3892570371\n"
        "1?HREG?400001?uint64@ABCDEFGH = 281479276038587371\n"
        "1?HREG?400001?string-4@AB = \"\\x03\\xe8\\x03\\xe9\"\n"
        "1?LONG?5000?unsignedInt@ABCD = 600018000\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(ReadTest, KeysThatTheDriverDoesNotKnowAreToldOnce) {
    const Outcome outcome = readWith({"--sim", "--set", "timout=5", "--set", "Node3::timout=5",
                                      "--set", "Node3::timeout=5", "--set", "wholly=1"},
                                     {"1?OUTP?3?boolean"});
    EXPECT_EQ(
        "mrtu: configuration: unknown key 'timout'; did you mean 'timeout'?\n"
        "mrtu: configuration: unknown key 'wholly'; 'mrtu describe parameters' lists the "
        "keys\n",
        outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

struct Failing {
    const char* uri;
    int exitCode;
    const char* complaint;
};

const Failing kFailing[] = {
    {"77?HREG?400001?int", 4, "mrtu: 77?HREG?400001?int: error -4: No response\n"},
    {"1?HREG?410001?int", 5,
     "mrtu: 1?HREG?410001?int: error -6: Exception: Illegal data address\n"},
    {"255?HREG?400001?int", 2, "mrtu: 255?HREG?400001?int: error -10: Node disabled\n"},
    {"0?HREG?400001?int", 2, "mrtu: 0?HREG?400001?int: error -10: Broadcast request\n"},
    {"1?HREG?400001", 2,
     "mrtu: 1?HREG?400001: error -1: Tag URI error: 1?HREG?400001 - there must be 4 tag "
     "specification fields\n"},
    {"1?HREG?400001?word", 2,
     "mrtu: 1?HREG?400001?word: error -1: Tag URI error: 1?HREG?400001?word - word: data type "
     "unknown\n"},
    {"1?HREG?400000?int", 2,
     "mrtu: 1?HREG?400000?int: error -1: Tag URI error: 1?HREG?400000?int - invalid offset for "
     "this memory type\n"},
    {"1?HREG?465536?int", 2, "mrtu: 1?HREG?465536?int: error -1: Tag exceeds the memory area\n"},
    {"1?HREG?400001?short(swap3)", 2,
     "mrtu: 1?HREG?400001?short(swap3): error -9: the conversions can't be applied to this type\n"},
    {"1?HREG?400001?string-3(swap2)", 2,
     "mrtu: 1?HREG?400001?string-3(swap2): error -9: the conversions can't be applied to this "
     "type\n"},
    {"1?HREG?400001?float@ABDC", 2,
     "mrtu: 1?HREG?400001?float@ABDC: error -1: 'ABDC' is no byte order of float: ABCD, CDAB, "
     "DCBA, BADC\n"},
    {"1?HREG?400001?string-1000000(swap2)", 2,
     "mrtu: 1?HREG?400001?string-1000000(swap2): error -1: Tag exceeds the memory area\n"},
    // 1000 is 0x03E8: the device's value is no BCD number, the URI is in order.
    {"1?HREG?400001?unsignedShort(bcd)", 1,
     "mrtu: 1?HREG?400001?unsignedShort(bcd): error -9: read conversion error\n"},
};

const std::vector<std::string> kImpatient{"--sim", "--timeout", "100", "--set", "repeat=0"};

TEST(ReadTest, EachFailureHasItsTextAndExitCode) {
    for (const Failing& row : kFailing) {
        const Outcome outcome = readWith(kImpatient, {row.uri});
        EXPECT_EQ("", outcome.out) << row.uri;
        EXPECT_EQ(row.complaint, outcome.err);
        EXPECT_EQ(row.exitCode, outcome.exitCode) << row.uri;
    }
}

TEST(ReadTest, AFailureDoesNotStopTheOthersAndTheFirstDecides) {
    const std::string good = "1?HREG?400001?unsignedShort";
    const Outcome noResponse =
        readWith(kImpatient, {good, "77?HREG?400001?int", "1?HREG?410001?int", good});
    EXPECT_EQ(good + " = 1000\n" + good + " = 1000\n", noResponse.out);
    EXPECT_EQ(4, noResponse.exitCode);
    const Outcome exception =
        readWith(kImpatient, {"1?HREG?410001?int", "1?HREG?400001", "77?HREG?400001?int"});
    EXPECT_EQ(5, exception.exitCode);
}

TEST(ReadTest, JsonHoldsValuesAndErrors) {
    std::vector<std::string> options = kImpatient;
    options.push_back("--json");
    const Outcome outcome = readWith(
        options, {"1?HREG?400001?unsignedShort-2", "1?OUTP?3?boolean", "77?HREG?400001?int"});
    EXPECT_EQ(nlohmann::json::parse(R"([
        {"uri": "1?HREG?400001?unsignedShort-2", "type": "unsignedShort-2", "value": [1000, 1001]},
        {"uri": "1?OUTP?3?boolean", "type": "boolean", "value": true},
        {"uri": "77?HREG?400001?int", "error": {"code": -4, "text": "No response"}}])"),
              nlohmann::json::parse(outcome.out));
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(4, outcome.exitCode);
}

TEST(ReadTest, TraceShowsEveryFrame) {
    const Outcome outcome = readWith({"--sim", "--trace"}, {"1?HREG?400001?unsignedShort"});
    EXPECT_NE(outcome.err.find(" com1 > 01 03 00 00 00 01 84 0A\n"), std::string::npos)
        << outcome.err;
    // CRC of 01 03 02 03 E8, computed apart from this project.
    EXPECT_NE(outcome.err.find(" com1 < 01 03 02 03 E8 B8 FA\n"), std::string::npos) << outcome.err;
    EXPECT_EQ("1?HREG?400001?unsignedShort = 1000\n", outcome.out);
}

TEST(ReadTest, APortIsNamedOrServesTheConfiguredOne) {
    const cli_test::RunningSim sim({});
    for (const std::string& port : {sim.device(), "com1=" + sim.device()}) {
        const Outcome outcome = readWith({"--port", port}, {"1?HREG?400001?unsignedShort"});
        EXPECT_EQ("1?HREG?400001?unsignedShort = 1000\n", outcome.out) << port;
        EXPECT_EQ(0, outcome.exitCode) << outcome.err;
    }
    const Outcome other =
        readWith({"--set", "uart=com7", "--port", "com7=" + sim.device()}, {"1?OUTP?3?boolean"});
    EXPECT_EQ("1?OUTP?3?boolean = 1\n", other.out) << other.err;
}

}  // namespace
