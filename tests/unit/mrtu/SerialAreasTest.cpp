// The settings of the line, staged, committed and persisted while running.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::ScriptedPort;

const char* const kBaud = "1?SP_Baud?0?unsignedInt";
const char* const kParity = "1?SP_Par?0?unsignedByte";
const char* const kStop = "1?SP_Stop?0?unsignedByte";
const char* const kMode = "1?SP_Mode?0?unsignedByte";
const char* const kDone = "1?SP_Done?0?boolean";

using AllSettings = std::vector<ScriptedPort::Settings>;

class SerialAreasTest : public DriverTest {};

TEST_F(SerialAreasTest, ConfiguredSettingsAreRead) {
    start("txMode=ASCII baudrate=19200 parity=odd bits=7 stopbits=2 mode=RS-422");
    EXPECT_EQ(19200, readNumber(kBaud));
    EXPECT_EQ(2, readByte(kParity));
    EXPECT_EQ(2, readByte(kStop));
    EXPECT_EQ(2, readByte(kMode));
    EXPECT_EQ(0, readByte(kDone));
}

TEST_F(SerialAreasTest, NotStartedRefusesReadsAndWrites) {
    configure();
    for (const char* uri :
         {kBaud, kParity, kStop, kMode, kDone, "1?NO?0?unsignedByte", "1?NP_Mode?0?boolean"}) {
        SCOPED_TRACE(uri);
        plantError();
        EXPECT_FALSE(read(tag(uri), 1));
        expectError(-3, "Protocol not started");
        plantError();
        EXPECT_EQ(0, write(tag(uri), hex("01 00 00 00"), 1));
        expectError(-3, "Protocol not started");
    }
    EXPECT_TRUE(host.storage.calls().empty());
}

TEST_F(SerialAreasTest, NothingHereReachesTheLineOrTakesTheLock) {
    start("delay=5");
    const int locked = host.multiTask.timesLocked();
    writeNumber(kBaud, 38400);
    writeByte(kParity, 1);
    writeByte(kDone, 1);
    readNumber(kBaud);
    EXPECT_TRUE(port.sent().empty());
    EXPECT_EQ(locked, host.multiTask.timesLocked());
    EXPECT_TRUE(host.multiTask.sleeps().empty());
}

TEST_F(SerialAreasTest, ListedBaudRatesOnly) {
    start();
    for (const int baud : {150, 300, 600, 1200, 2400, 4800, 9600, 19200, 38400, 57600, 115200}) {
        EXPECT_NE(0, writeNumber(kBaud, baud)) << baud;
        EXPECT_EQ(baud, readNumber(kBaud));
    }
    for (const int baud : {0, -9600, 14400, 110, 230400, 115201}) {
        EXPECT_EQ(0, writeNumber(kBaud, baud)) << baud;
        EXPECT_EQ(115200, readNumber(kBaud)) << "nothing is staged";
    }
}

struct RangeCase {
    const char* uri;
    int value;
    bool accepted;
};

TEST_F(SerialAreasTest, RangesOfTheByteSettings) {
    start();
    const RangeCase cases[] = {
        {kParity, 0, true},    {kParity, 1, true}, {kParity, 4, true},  {kParity, 5, false},
        {kParity, 255, false}, {kStop, 1, true},   {kStop, 2, true},    {kStop, 0, false},
        {kStop, 3, false},     {kStop, 7, false},  {kStop, 255, false}, {kMode, 0, true},
        {kMode, 2, true},      {kMode, 3, false},  {kMode, 255, false},
    };
    for (const RangeCase& range : cases) {
        SCOPED_TRACE(std::string(range.uri) + " = " + std::to_string(range.value));
        const int before = readByte(range.uri);
        plantError();
        EXPECT_EQ(range.accepted, writeByte(range.uri, range.value) != 0);
        EXPECT_EQ(range.accepted ? range.value : before, readByte(range.uri));
        expectPlantedError();
    }
}

TEST_F(SerialAreasTest, StagedValuesAreReadAtOnceButChangeNothingYet) {
    start();
    EXPECT_NE(0, writeByte(kStop, 2));
    EXPECT_EQ(2, readByte(kStop));
    EXPECT_EQ((AllSettings{{9600, 0, 8, 1, 0}}), port.settings());
    EXPECT_EQ("none", host.stored.describe("MRTU", "stop"));
    EXPECT_EQ("com1,9600,none,8,1,RS-232", [this] {
        char text[64] = {};
        driver->vcsGetComParams(text, sizeof text);
        return std::string(text);
    }());
    writeByte(kDone, 0);
    EXPECT_EQ((AllSettings{{9600, 0, 8, 1, 0}, {9600, 0, 8, 2, 0}}), port.settings());
}

TEST_F(SerialAreasTest, CommitAppliesAndPersistsEverything) {
    start("txMode=ASCII bits=7");
    host.storage.forget();
    writeNumber(kBaud, 38400);
    writeByte(kParity, 4);
    writeByte(kStop, 2);
    writeByte(kMode, 1);
    EXPECT_TRUE(host.storage.calls().empty());
    EXPECT_NE(0, writeByte(kDone, 0)) << "the value is not looked at";
    EXPECT_EQ((std::vector<std::string>{"writeInt(MRTU, baud, 38400)", "writeInt(MRTU, mode, 1)",
                                        "writeInt(MRTU, parity, 4)", "writeInt(MRTU, stop, 2)"}),
              host.storage.calls());
    EXPECT_EQ((ScriptedPort::Settings{38400, 4, 7, 2, 1}), port.settings().back());
}

TEST_F(SerialAreasTest, CommitOfOneSettingKeepsTheOthers) {
    start("parity=even");
    writeNumber(kBaud, 300);
    host.storage.forget();
    writeByte(kDone, 1);
    EXPECT_EQ(std::vector<std::string>{"writeInt(MRTU, baud, 300)"}, host.storage.calls());
    EXPECT_EQ((ScriptedPort::Settings{300, 1, 8, 1, 0}), port.settings().back());
}

TEST_F(SerialAreasTest, CommitWithNothingStagedSetsTheSameSettingsAgain) {
    start();
    host.storage.forget();
    EXPECT_NE(0, writeByte(kDone, 1));
    EXPECT_TRUE(host.storage.calls().empty());
    EXPECT_EQ((AllSettings{{9600, 0, 8, 1, 0}, {9600, 0, 8, 1, 0}}), port.settings());
}

TEST_F(SerialAreasTest, CommitRecomputesTheGap) {
    start("repeat=0");
    for (const auto& [baud, gap] : {std::pair{150, 800}, {115200, 2}, {9600, 13}}) {
        writeNumber(kBaud, baud);
        writeByte(kDone, 1);
        port.forget();
        port.reply(rtuFrame(hex("01 03 02 12 34")));
        EXPECT_TRUE(read(tag("1?HREG?400001?short"), 1));
        EXPECT_EQ(gap, port.frameWaits().at(0).gapMs) << baud;
    }
}

TEST_F(SerialAreasTest, StagedEntriesAreNotCleared) {
    start();
    writeNumber(kBaud, 38400);
    writeByte(kDone, 1);
    host.storage.forget();
    writeByte(kDone, 1);
    EXPECT_EQ(std::vector<std::string>{"writeInt(MRTU, baud, 38400)"}, host.storage.calls());
    EXPECT_EQ(38400, readNumber(kBaud));
}

TEST_F(SerialAreasTest, CommittedSettingsAreReported) {
    start();
    writeNumber(kBaud, 57600);
    writeByte(kParity, 3);
    writeByte(kStop, 2);
    writeByte(kMode, 2);
    writeByte(kDone, 1);
    char text[64] = {};
    EXPECT_EQ(1, driver->vcsGetComParams(text, sizeof text));
    EXPECT_STREQ("com1,57600,mark,8,2,RS-422", text);
}

TEST_F(SerialAreasTest, CommittedSettingsHoldAfterStopAndStartAndInANewObject) {
    start();
    writeNumber(kBaud, 57600);
    writeByte(kDone, 1);
    driver->Stop();
    driver->Start();
    EXPECT_EQ(57600, port.settings().back().baud);
    restartDriver();
    start();
    EXPECT_EQ(57600, port.settings().back().baud);
    EXPECT_EQ(57600, readNumber(kBaud));
}

TEST_F(SerialAreasTest, StagedButNotCommittedIsLostWithTheObject) {
    start();
    writeNumber(kBaud, 57600);
    restartDriver();
    start();
    EXPECT_EQ(9600, port.settings().back().baud);
}

TEST_F(SerialAreasTest, WithoutStorageSettingsLiveAsLongAsTheObject) {
    host.storage.refuseWrites();
    start();
    writeNumber(kBaud, 57600);
    writeByte(kDone, 1);
    EXPECT_EQ(57600, port.settings().back().baud);
    restartDriver();
    start();
    EXPECT_EQ(9600, port.settings().back().baud);
}

TEST_F(SerialAreasTest, NodesShareTheLine) {
    start();
    writeNumber("2?SP_Baud?0?unsignedInt", 300);
    EXPECT_EQ(300, readNumber("7?SP_Baud?0?unsignedInt"));
}

TEST_F(SerialAreasTest, PortThatRefusesTheNewSettingsIsNoFailureOfTheCommit) {
    start();
    port.refuseSettings();
    writeNumber(kBaud, 300);
    EXPECT_NE(0, writeByte(kDone, 1));
    EXPECT_EQ("int:300", host.stored.describe("MRTU", "baud"));
}

TEST_F(SerialAreasTest, ThroughTheRunTimeForm) {
    start();
    ITag* baud = driver->CreateTag(kBaud);
    const unsigned char value[] = {0x00, 0x96, 0x00, 0x00};  // 38400
    EXPECT_NE(0, driver->Write(baud, value)) << driver->GetLastErrorString();
    unsigned char back[4] = {};
    EXPECT_NE(0, driver->Read(baud, back)) << driver->GetLastErrorString();
    EXPECT_EQ(0x96, back[1]);
    driver->FreeTag(baud);
    EXPECT_EQ("written ok\n", command("write 1?SP_Stop?0?unsignedByte 02"));
    EXPECT_EQ("02\n", command("read 1?SP_Stop?0?unsignedByte"));
    EXPECT_EQ("written ok\n", command("write 1?SP_Done?0?boolean 01"));
    EXPECT_EQ((ScriptedPort::Settings{38400, 0, 8, 2, 0}), port.settings().back());
    EXPECT_EQ("written ok\n", command("write 1?NO?0?unsignedByte 09"));
    EXPECT_EQ("09\n", command("read 1?NO?0?unsignedByte"));
    EXPECT_EQ("written ok\n", command("write 1?NP_Mode?0?boolean 00"));
    EXPECT_EQ("00\n", command("read 1?NP_Mode?0?boolean"));
}

}  // namespace
