// The life of a protocol object: start, stop, the port, the persisted overrides.
#include <climits>

#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::ScriptedPort;

class StartStopTest : public DriverTest {
  protected:
    /// The node in the request of a read of `node`.
    int lineNode(int node) {
        port.forget();
        port.silence();
        EXPECT_FALSE(read(tag(std::to_string(node) + "?HREG?400001?short"), 1));
        return port.sent().empty() ? -1 : port.sent()[0][0];
    }
};

TEST_F(StartStopTest, StartOpensAndConfiguresThePort) {
    configure("txMode=ASCII uart=com1 baudrate=19200 parity=odd bits=7 stopbits=2 mode=RS-485");
    EXPECT_EQ(1, driver->Start());
    EXPECT_EQ(std::vector<std::string>{"com1"}, host.serialFactory.opened());
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{19200, 2, 7, 2, 1}}), port.settings());
}

TEST_F(StartStopTest, SecondStartOpensNothing) {
    start();
    EXPECT_NE(0, driver->Start());
    EXPECT_EQ(1U, host.serialFactory.opened().size());
    EXPECT_EQ(1U, port.settings().size());
}

TEST_F(StartStopTest, SecondStartReloadsNothing) {
    start();
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    host.storage.forget();
    EXPECT_NE(0, driver->Start());
    EXPECT_TRUE(host.storage.calls().empty());
}

TEST_F(StartStopTest, StopGivesThePortBack) {
    start();
    EXPECT_NE(0, driver->Stop());
    EXPECT_EQ(1, host.serialFactory.released());
    EXPECT_NE(0, driver->Stop());
    EXPECT_EQ(1, host.serialFactory.released());
}

TEST_F(StartStopTest, StopTakesTheTransactionLock) {
    start();
    const int before = host.multiTask.timesLocked();
    driver->Stop();
    EXPECT_EQ(before + 1, host.multiTask.timesLocked());
}

TEST_F(StartStopTest, StartDoesNotTakeTheTransactionLock) {
    start();
    EXPECT_EQ(0, host.multiTask.timesLocked());
}

TEST_F(StartStopTest, StopBeforeStartTouchesNothing) {
    configure();
    EXPECT_NE(0, driver->Stop());
    EXPECT_EQ(0, host.multiTask.timesLocked());
    EXPECT_EQ(0, host.serialFactory.released());
    EXPECT_TRUE(host.serialFactory.opened().empty());
}

TEST_F(StartStopTest, StartsAgainAfterStop) {
    start();
    driver->Stop();
    EXPECT_NE(0, driver->Start());
    EXPECT_EQ(2U, host.serialFactory.opened().size());
    EXPECT_EQ(2U, port.settings().size());
}

TEST_F(StartStopTest, MissingPortFailsTheStart) {
    configure("uart=com9");
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_EQ(std::vector<std::string>{"com9"}, host.serialFactory.opened());
    EXPECT_EQ(0, host.serialFactory.released());
    EXPECT_FALSE(read(tag("1?HREG?400001?short"), 1));
    expectError(-3, "Protocol not started");
}

TEST_F(StartStopTest, PortThatRefusesItsSettingsIsHandedBack) {
    configure();
    port.refuseSettings();
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_EQ(1, host.serialFactory.released());
    port.refuseSettings(false);
    EXPECT_NE(0, driver->Start()) << "nothing is left of the first try";
    EXPECT_EQ(2U, host.serialFactory.opened().size());
}

TEST_F(StartStopTest, BaudRateZeroFailsTheStartWithoutThePort) {
    configure("baudrate=0");
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_TRUE(host.serialFactory.opened().empty());
}

TEST_F(StartStopTest, DestructorGivesThePortBackWithoutTheLock) {
    start();
    const int before = host.multiTask.timesLocked();
    driver.reset();
    EXPECT_EQ(1, host.serialFactory.released());
    EXPECT_EQ(before, host.multiTask.timesLocked());
    EXPECT_EQ(0, host.multiTask.locksAlive());
}

TEST_F(StartStopTest, OneLockForTheLifeOfTheObject) {
    EXPECT_EQ(1, host.multiTask.locksAlive());
    start();
    driver->Stop();
    driver->Start();
    EXPECT_EQ(1, host.multiTask.locksAlive());
}

TEST_F(StartStopTest, GapFollowsTheBaudRate) {
    const std::pair<int, int> gaps[] = {{150, 800}, {1200, 100}, {9600, 13},  {19200, 7},
                                        {38400, 4}, {57600, 3},  {115200, 2}, {250000, 1}};
    for (const auto& [baud, gap] : gaps) {
        restartDriver();
        port.forget();
        start("repeat=0 baudrate=" + std::to_string(baud));
        port.reply(rtuFrame(hex("01 03 02 12 34")));
        EXPECT_TRUE(read(tag("1?HREG?400001?short"), 1));
        ASSERT_EQ(1U, port.frameWaits().size());
        EXPECT_EQ(gap, port.frameWaits()[0].gapMs) << baud;
    }
}

TEST_F(StartStopTest, MaximumTimeOfATagIsTimeoutTimesRepeat) {
    configure(
        "timeout=2000 repeat=2 Node2::repeat=0 Node3::timeout=500 "
        "Node4::timeout=2000000000 Node5::repeat=-1");
    EXPECT_EQ(4000, driver->GetMaxTm(tag("1?HREG?400001?short")));
    EXPECT_EQ(0, driver->GetMaxTm(tag("2?HREG?400001?short")));
    EXPECT_EQ(1000, driver->GetMaxTm(tag("3?HREG?400001?short")));
    EXPECT_EQ(INT_MAX, driver->GetMaxTm(tag("4?HREG?400001?short")));
    EXPECT_EQ(-2000, driver->GetMaxTm(tag("5?HREG?400001?short")));
    EXPECT_EQ(INT_MAX, driver->GetMaxTm(nullptr));
}

TEST_F(StartStopTest, MaximumTimeWithoutATag) {
    EXPECT_EQ(0, driver->GetMaxTm(nullptr));
    configure();
    EXPECT_EQ(4000, driver->GetMaxTm(nullptr));
    EXPECT_EQ("maxtm = 4000 ms\n", command("getmaxtm"));
}

TEST_F(StartStopTest, PersistedNodeOverridesAreRestored) {
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    host.stored.put("MRTU", "tempNode0x0A", std::string("017"));
    host.stored.put("MRTU", "tempNode3", std::string("nonsense"));
    host.stored.put("MRTU", "baudx", std::string("7"));
    host.stored.put("MRTU", "xtempNode2", std::string("7"));
    host.stored.put("MRTU", "node3_ModiconMode", true);
    host.stored.put("OTHER", "tempNode2", std::string("8"));
    start("repeat=0");
    EXPECT_EQ("id 10 -> 15\nid 1 -> 9\nid 3 -> 0\n", command("getid"));
    EXPECT_EQ(9, lineNode(1));
    EXPECT_EQ(15, lineNode(10));
    EXPECT_EQ(2, lineNode(2));
}

TEST_F(StartStopTest, RestoringWritesNothing) {
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    start();
    for (const char* operation : {"writeString", "writeBool", "writeInt", "removeKey"})
        EXPECT_EQ(0, host.storage.count(operation)) << operation;
}

TEST_F(StartStopTest, RestoreReplacesAndAppends) {
    EXPECT_EQ("id 5 set to 6\n", command("setid 5 6"));
    EXPECT_EQ("id 7 set to 8\n", command("setid 7 8"));
    host.stored.put("MRTU", "tempNode5", std::string("50"));
    host.stored.put("MRTU", "tempNode6", std::string("60"));
    start();
    EXPECT_EQ("id 5 -> 50\nid 7 -> 8\nid 6 -> 60\n", command("getid"));
}

TEST_F(StartStopTest, OverridesBelongToTheIdent) {
    host.stored.put("line A", "tempNode1", std::string("9"));
    host.stored.put("MRTU", "tempNode1", std::string("8"));
    driver->SetIdent("line A");
    start("repeat=0");
    EXPECT_EQ(9, lineNode(1));
}

TEST_F(StartStopTest, CopyingReadsAreUsedWithABufferOf256) {
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    start();
    EXPECT_EQ(0, host.storage.count("keyName"));
    EXPECT_EQ(0, host.storage.count("readString"));
    const auto calls = host.storage.calls();
    EXPECT_NE(calls.end(), std::find(calls.begin(), calls.end(), "keyNameInto(MRTU, 0, 256)"));
    EXPECT_NE(calls.end(),
              std::find(calls.begin(), calls.end(), "readStringInto(MRTU, tempNode1, 256)"));
}

TEST_F(StartStopTest, FailedCopyReadsAsEmptyText) {
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    host.storage.refuseCopies();
    start();
    EXPECT_EQ("no node configurated\n", command("getid"));
}

TEST_F(StartStopTest, PersistedSettingsReplaceTheConfiguredOnes) {
    host.stored.put("MRTU", "baud", 38400);
    host.stored.put("MRTU", "parity", 4);
    host.stored.put("MRTU", "stop", 2);
    host.stored.put("MRTU", "mode", 3);
    start("repeat=0");
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{38400, 4, 8, 2, 3}}), port.settings());
    port.reply(rtuFrame(hex("01 03 02 12 34")));
    EXPECT_TRUE(read(tag("1?HREG?400001?short"), 1));
    EXPECT_EQ(4, port.frameWaits().at(0).gapMs);
}

TEST_F(StartStopTest, SettingsAreAskedForInOrder) {
    start();
    std::vector<std::string> asked;
    for (const std::string& call : host.storage.calls())
        if (call.starts_with("hasKey")) asked.push_back(call);
    EXPECT_EQ((std::vector<std::string>{"hasKey(MRTU, baud)", "hasKey(MRTU, parity)",
                                        "hasKey(MRTU, stop)", "hasKey(MRTU, mode)"}),
              asked);
}

/// The first look decides for the life of the object, so a later configuration of the line counts
/// for a new object only.
TEST_F(StartStopTest, SettingsOfTheFirstStartStayInForce) {
    start("baudrate=9600");
    driver->Stop();
    start("baudrate=19200");
    EXPECT_EQ(9600, port.settings().back().baud);
    restartDriver();
    start("baudrate=19200");
    EXPECT_EQ(19200, port.settings().back().baud);
}

TEST_F(StartStopTest, PersistedBaudRateZeroFailsTheStart) {
    host.stored.put("MRTU", "baud", 0);
    configure();
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_TRUE(host.serialFactory.opened().empty());
}

/// The first look-up of an override decides for good, so it must not come before there is a value.
TEST_F(StartStopTest, StartBeforeConfigFailsAndSpoilsNothing) {
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_EQ(0, driver->Config("CfgVer=1 uart=com1"));
    EXPECT_EQ(0, driver->Start()) << "a text that is refused as a whole configures nothing";
    EXPECT_TRUE(host.storage.calls().empty());
    EXPECT_TRUE(host.serialFactory.opened().empty());
    start();
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{9600, 0, 8, 1, 0}}), port.settings());
}

TEST_F(StartStopTest, HostIsAskedForAPortWithoutAName) {
    configure("uart=");
    EXPECT_EQ(0, driver->Start());
    expectError(-1, "Can't open serial port");
    EXPECT_EQ(std::vector<std::string>{""}, host.serialFactory.opened());

    host.serialFactory.offer("", port);
    EXPECT_NE(0, driver->Start()) << "what a name means is the host's";
}

TEST_F(StartStopTest, PortOfAConfigurationRefusedForItsModeIsTheOneThatIsOpened) {
    configure("uart=com9");
    EXPECT_EQ(0, driver->Config(driver_test::configText("baudrate=19200 mode=bad").c_str()));
    EXPECT_NE(0, driver->Start());
    EXPECT_EQ(std::vector<std::string>{"com1"}, host.serialFactory.opened());
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{19200, 0, 8, 1, 0}}), port.settings());
}

}  // namespace
