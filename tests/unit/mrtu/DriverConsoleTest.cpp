// The driver's own console commands, to the last byte of the answer's space.
#include <cstring>

#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;

const std::string kBaseHelp =
    "help - displays this message\n"
    "info - displays information about the protocol version\n"
    "xml  - displays the protocol xml description\n"
    "read uri - reads data pointed by uri string\n"
    "write uri hexData - writes data pointed by uri string\n"
    "lasterror - displays the last protocol error\n"
    "getmaxtm - displays the max time for executing a single read/write access\n";
const std::string kOwnHelp =
    "setid n m - set the node id n to m\n"
    "getid - get all changed node id's\n";

constexpr int kGuards = 16;
constexpr char kGuard = '\x5A';

class DriverConsoleTest : public DriverTest {
  protected:
    /// The answer's space after a command, `size` bytes; the test fails when a byte in front of it
    /// or behind it changed.
    std::string guarded(const std::string& line, int size, int result = 1) {
        std::string space(static_cast<std::size_t>(size + 2 * kGuards), kGuard);
        EXPECT_EQ(result, driver->DoCommand(line.c_str(), space.data() + kGuards, size))
            << line << " into " << size;
        const std::string guards(kGuards, kGuard);
        EXPECT_EQ(guards, space.substr(0, kGuards)) << line << " into " << size;
        EXPECT_EQ(guards, space.substr(static_cast<std::size_t>(kGuards + size)))
            << line << " into " << size;
        return space.substr(kGuards, static_cast<std::size_t>(size));
    }

    /// A bounded copy: cut at the size, padded with zeroes.
    static std::string bounded(const std::string& text, int size) {
        std::string space = text.substr(0, static_cast<std::size_t>(size));
        space.resize(static_cast<std::size_t>(size), '\0');
        return space;
    }
};

TEST_F(DriverConsoleTest, HelpIsTheBaseHelpWithTheDriversBehind) {
    EXPECT_EQ(kBaseHelp + kOwnHelp, command("help"));
}

TEST_F(DriverConsoleTest, HelpIntoEverySize) {
    const std::string whole = kBaseHelp + kOwnHelp;
    for (int size = 0; size <= static_cast<int>(whole.size()) + 2; ++size) {
        const std::string answer = guarded("help", size);
        EXPECT_EQ(whole.substr(0, static_cast<std::size_t>(size)),
                  answer.substr(0, std::min(whole.size(), answer.size())))
            << size;
        if (answer.size() > whole.size()) {
            EXPECT_EQ('\0', answer[whole.size()]) << size;
        }
    }
}

TEST_F(DriverConsoleTest, SetIdRecordsAndPersists) {
    EXPECT_EQ("id 5 set to 9\n", command("setid 5 9"));
    EXPECT_EQ("text:9", host.stored.describe("MRTU", "tempNode5"));
    EXPECT_EQ("id 5 -> 9\n", command("getid"));
}

TEST_F(DriverConsoleTest, SetIdToZeroClearsTheOverride) {
    command("setid 5 9");
    EXPECT_EQ("id 5 set to 5\n", command("setid 5 0"));
    EXPECT_EQ("none", host.stored.describe("MRTU", "tempNode5"));
    EXPECT_EQ("id 5 -> 5\n", command("getid"));
}

TEST_F(DriverConsoleTest, SetIdReadsAutomaticBases) {
    EXPECT_EQ("id 16 set to 8\n", command("setid 0x10 010"));
    EXPECT_EQ("id 0 set to 12\n", command("setid abc 12abc"));
    EXPECT_EQ("id 7 set to -3\n", command("setid 7 -3"));
    EXPECT_EQ("id 16 -> 8\nid 0 -> 12\nid 7 -> -3\n", command("getid"));
}

TEST_F(DriverConsoleTest, SetIdNeedsThreeWords) {
    for (const char* line : {"setid", "setid 5", "setid 5 6 7", "setid  5 6", "setid 5 6 "})
        EXPECT_EQ("invalid format\n", command(line)) << line;
    EXPECT_EQ("no node configurated\n", command("getid"));
}

TEST_F(DriverConsoleTest, SetIdWorksBeforeConfigurationAndStart) {
    EXPECT_EQ("id 1 set to 2\n", command("setid 1 2"));
}

TEST_F(DriverConsoleTest, SetIdIntoEverySize) {
    for (int size = 0; size <= 20; ++size) {
        EXPECT_EQ(bounded("id 5 set to 9\n", size), guarded("setid 5 9", size)) << size;
        EXPECT_EQ(bounded("invalid format\n", size), guarded("setid 5", size)) << size;
    }
}

TEST_F(DriverConsoleTest, GetIdWithoutOverrides) {
    EXPECT_EQ("no node configurated\n", command("getid"));
    for (int size = 0; size <= 30; ++size)
        EXPECT_EQ(bounded("no node configurated\n", size), guarded("getid", size)) << size;
}

TEST_F(DriverConsoleTest, GetIdListsPairsInOrderOfInsertion) {
    command("setid 7 8");
    command("setid 5 6");
    command("setid 7 9");
    EXPECT_EQ("id 7 -> 9\nid 5 -> 6\n", command("getid"));
}

/// A line is written when it fits, exactly or with room; its zero only when there is room for it.
/// The default text was there before, so where no line fits it shows.
TEST_F(DriverConsoleTest, GetIdIntoEverySize) {
    const std::string first = "id 7 -> 9\n";
    const std::string second = "id 15 -> 16\n";
    command("setid 7 9");
    command("setid 15 16");
    for (int size = 0; size <= 40; ++size) {
        SCOPED_TRACE(size);
        const auto room = static_cast<std::size_t>(size);
        std::string expected;
        if (room >= first.size()) expected = first;
        if (room >= first.size() + second.size()) expected += second;
        const std::string answer = guarded("getid", size);
        if (expected.empty()) {
            EXPECT_EQ(bounded("no node configurated\n", size), answer);
            continue;
        }
        EXPECT_EQ(expected, answer.substr(0, expected.size()));
        if (room > expected.size()) {
            EXPECT_EQ('\0', answer[expected.size()]);
        }
    }
}

TEST_F(DriverConsoleTest, CommandWordsAreExact) {
    for (const char* line :
         {"", "HELP", "Setid 5 9", "SETID 5 9", "getids", "getId", " getid", "x"})
        EXPECT_EQ(std::string(32, kGuard), guarded(line, 32, 0)) << line;
}

TEST_F(DriverConsoleTest, BaseCommandsStillWork) {
    EXPECT_EQ("compressedXML=2224", command("xml"));
    EXPECT_EQ("maxtm = 0 ms\n", command("getmaxtm"));
    EXPECT_EQ("", command("lasterror"));
    plantError();
    EXPECT_EQ("protocol does not support alarms", command("lasterror"));
    EXPECT_EQ("Protocol: MRTU (184) v.126\n", command("info").substr(0, 27));
    EXPECT_EQ("error: missing parameter (URI string)\n", command("read"));
    EXPECT_EQ("error: missing parameters (URI string + data)\n", command("write 1?OUTP?1?boolean"));
}

TEST_F(DriverConsoleTest, ReadAndWriteReachTheLine) {
    start("repeat=0");
    port.reply(driver_test::rtuFrame(driver_test::hex("01 03 02 12 34")));
    EXPECT_EQ("3412\n", command("read 1?HREG?400001?short"));
    port.silence();
    EXPECT_EQ("No response", command("read 1?HREG?400001?short"));
    port.reply(driver_test::rtuFrame(driver_test::hex("01 10 00 00 00 01")));
    EXPECT_EQ("written ok\n", command("write 1?HREG?400001?short 3412"));
    EXPECT_EQ("Tag URI error: 1?HREG?400001?word - word: data type unknown",
              command("read 1?HREG?400001?word"));
}

}  // namespace
