// Command lines and configurations that are not accepted, and questions.
#include <gtest/gtest.h>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;

const std::string kUri = "1?HREG?400001?unsignedShort";

TEST(Usage, WrongCommandLinesExitWithTwo) {
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
    };
    for (const auto& words : rows) {
        const Outcome outcome = mrtu(words);
        const std::string last = words.empty() ? "nothing" : words.back();
        EXPECT_EQ(outcome.exitCode, 2) << last;
        EXPECT_EQ(outcome.out, "") << last;
        EXPECT_NE(outcome.err, "") << last;
    }
}

TEST(Usage, AMisspeltCommandIsNamed) {
    EXPECT_NE(mrtu({"reed", kUri}).err.find("reed"), std::string::npos);
}

TEST(Usage, EveryCommandExplainsItselfWithExamples) {
    for (const char* const command : {"read", "write", "console", "override", "info", "sim"}) {
        const Outcome outcome = mrtu({command, "--help"});
        EXPECT_EQ(outcome.exitCode, 0) << command;
        EXPECT_NE(outcome.out.find("Examples:\n  mrtu " + std::string(command)), std::string::npos)
            << outcome.out;
    }
    const Outcome outcome = mrtu({"--help"});
    EXPECT_EQ(outcome.exitCode, 0);
    EXPECT_NE(outcome.out.find("Exit codes:"), std::string::npos);
}

TEST(Usage, VersionIsTheProjects) {
    const Outcome outcome = mrtu({"--version"});
    EXPECT_EQ(outcome.out, "mrtu " MRTU_VERSION "\n");
    EXPECT_EQ(outcome.exitCode, 0);
}

TEST(Configuration, ThatTheDriverRefusesIsAUsageError) {
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
        EXPECT_EQ(outcome.err, "mrtu: configuration: " + std::string(row.complaint) + "\n");
        EXPECT_EQ(outcome.exitCode, 2) << row.text;
    }
}

TEST(Configuration, ThatCannotBeReadIsAUsageError) {
    const std::string missing = cli_test::scratchFolder() + "/none.cfg";
    const Outcome outcome = mrtu({"read", "--sim", "--config", missing, kUri});
    EXPECT_EQ(outcome.err, "mrtu: configuration " + missing + ": No such file or directory\n");
    EXPECT_EQ(outcome.exitCode, 2);
}

TEST(Info, TellsWhatTheDriverSaysOfItself) {
    const Outcome outcome = mrtu({"info", "--plugin", MRTU_PLUGIN});
    EXPECT_EQ(outcome.out, "plug-in        " MRTU_PLUGIN
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
                           "runtime::Sockets v.100\n");
    EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
}

}  // namespace
