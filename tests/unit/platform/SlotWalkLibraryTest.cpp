// The library's own protocol object, called through its table.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "tests/unit/mrtu/DriverTest.h"
#include "tests/unit/platform/ProtocolOperations.h"

namespace {

using driver_test::hex;
using driver_test::rtuFrame;
using slots::call;
using slots::protocolSlot;
using Text = const char*;

class SlotWalkLibraryTest : public driver_test::DriverTest {
  protected:
    IProtocol* protocol() { return driver.get(); }

    template <class Result, class... Arguments>
    Result run(const char* operation, Arguments... arguments) {
        return call<Result, Arguments...>(protocol(), protocolSlot(operation), arguments...);
    }
};

TEST_F(SlotWalkLibraryTest, Identities) {
    EXPECT_EQ(protocol(), run<void*>("ConvertTo", Text("IProtocol7")));
    EXPECT_STREQ("Protocol_MRTU", run<Text>("GetImpName"));
    EXPECT_EQ(100, run<int>("GetImpVersion"));
    EXPECT_STREQ("MRTU", run<Text>("GetName"));
    EXPECT_STREQ("MRTU", run<Text>("GetNextInstanceName"));
    EXPECT_EQ(1, run<int>("GetLastError"));
    EXPECT_STREQ("", run<Text>("GetLastErrorString"));
    EXPECT_EQ(126, run<int>("GetProtocolVersion"));
    EXPECT_EQ(184, run<int>("GetProtocolType"));
    EXPECT_STREQ("Modbus RTU", run<Text>("GetProtocolName"));
    char info[16];
    EXPECT_EQ(15, run<int>("GetInfo", static_cast<char*>(info), 15));
    EXPECT_EQ(0, std::memcmp("Protocol: MRTU ", info, 15));
    EXPECT_STREQ("compressedXML=2224", reinterpret_cast<Text>(run<const unsigned char*>("GetXml")));
    EXPECT_FALSE(run<bool>("IsConverted"));
    run<void>("SetIdent", Text("line2"));
    EXPECT_STREQ("line2", run<Text>("GetIdent"));
}

TEST_F(SlotWalkLibraryTest, LifeOfAChannel) {
    const std::string text = driver_test::configText();
    EXPECT_NE(0, run<int>("Config", text.c_str()));
    ITag* tag = run<ITag*>("CreateTag", Text("1?HREG?400001?unsignedShort"));
    ASSERT_NE(nullptr, tag);
    EXPECT_NE(0, run<int>("Start"));
    port.reply(rtuFrame(hex("01 03 02 12 34")));
    unsigned char value[2] = {};
    EXPECT_NE(0,
              run<int>("Read", static_cast<const ITag*>(tag), static_cast<unsigned char*>(value)));
    EXPECT_EQ(0x34, value[0]);
    EXPECT_EQ(0x12, value[1]);
    port.reply(rtuFrame(hex("01 10 00 00 00 01")));
    EXPECT_NE(0, run<int>("Write", static_cast<const ITag*>(tag),
                          static_cast<const unsigned char*>(value)));
    port.reply(rtuFrame(hex("01 03 02 12 34")));
    EXPECT_NE(0, run<int>("ReadBlock", static_cast<const ITag*>(tag),
                          static_cast<unsigned char*>(value), 2));
    port.reply(rtuFrame(hex("01 10 00 00 00 01")));
    EXPECT_NE(0, run<int>("WriteBlock", static_cast<const ITag*>(tag),
                          static_cast<const unsigned char*>(value), 2));
    EXPECT_EQ(1, run<int>("GetNodeID", static_cast<const ITag*>(tag)));
    EXPECT_EQ(16777215, run<int>("MaxUnusedGap", static_cast<const ITag*>(tag)));
    EXPECT_NE(0, run<int>("Stop"));
    EXPECT_EQ(1, host.serialFactory.released());
    run<void>("FreeTag", tag);
}

TEST_F(SlotWalkLibraryTest, ConsoleAndExtensions) {
    char answer[32] = {};
    EXPECT_EQ(1, run<int>("DoCommand", Text("setid 5"), static_cast<char*>(answer), 32));
    EXPECT_STREQ("invalid format\n", answer);
    EXPECT_EQ(0, run<int>("Extend", 1, static_cast<void*>(nullptr)));
    EXPECT_EQ(2, run<int>("vcsGetCapability"));
    EXPECT_EQ(1, run<int>("vcsGetComParams", static_cast<char*>(answer), 32));
    EXPECT_EQ(0, run<int>("vcsActivateInterleaved", static_cast<unsigned short>(1)));
}

/// What the driver has no use for says so, each in its own words.
TEST_F(SlotWalkLibraryTest, RefusalsTellOperationsApart) {
    EXPECT_EQ(0, run<int>("readObject", static_cast<const ITag*>(nullptr),
                          static_cast<IObjectString*>(nullptr)));
    EXPECT_STREQ("read object not supported", driver->GetLastErrorString());
    EXPECT_EQ(0, run<int>("writeObject", static_cast<const ITag*>(nullptr),
                          static_cast<const IObjectString*>(nullptr)));
    EXPECT_STREQ("write object not supported", driver->GetLastErrorString());
    EXPECT_EQ(nullptr, run<IEventChannel*>("createEventChannel(int)", 1));
    EXPECT_STREQ("protocol does not support event channel", driver->GetLastErrorString());
    EXPECT_EQ(nullptr, run<IAlarm*>("createAlarm", Text("x")));
    EXPECT_STREQ("protocol does not support alarms", driver->GetLastErrorString());
    EXPECT_EQ(nullptr, run<IEventChannel*>("createEventChannel(IEventProcessor*)",
                                           static_cast<IEventProcessor*>(nullptr)));
    EXPECT_STREQ("protocol does not support event channel", driver->GetLastErrorString());
    EXPECT_EQ(nullptr, run<ITrend*>("createTrend", Text("x")));
    EXPECT_STREQ("protocol does not support trends", driver->GetLastErrorString());
    EXPECT_EQ(0, run<int>("addEventSource", static_cast<IEventChannel*>(nullptr), Text("x")));
    EXPECT_STREQ("protocol does not support event channel", driver->GetLastErrorString());
    EXPECT_EQ(0, run<int>("quitAlarm", static_cast<IAlarm*>(nullptr)));
    EXPECT_EQ(0, run<int>("listAlarms", static_cast<IAlarmProcessor*>(nullptr)));
    unsigned long long next = 5;
    EXPECT_EQ(0, run<int>("readTrend", static_cast<ITrend*>(nullptr), 1ULL, 2ULL, &next, 3U, true,
                          static_cast<ITrendProcessor*>(nullptr)));
    EXPECT_EQ(5ULL, next);
    EXPECT_FALSE(run<bool>("MultipleReadSupported"));
    EXPECT_FALSE(run<bool>("MultipleWriteSupported"));
    EXPECT_EQ(nullptr, run<void*>("GetInterface", Text("IProtocol")));
}

TEST_F(SlotWalkLibraryTest, TagUriFields) {
    EXPECT_EQ(4, run<int>("getTagUriFieldCount"));
    EXPECT_STREQ("memorytype", run<Text>("getTagUriFieldName", 1));
    EXPECT_EQ(2, run<int>("getTagUriFieldPosition", Text("arrayindex.subindex")));
    configure();
    const ITag* one = tag("1?HREG?400001?unsignedShort");
    int length = 0;
    EXPECT_EQ(one->GetVarName() + 7, run<Text>("getTagUriField", one, 2, &length));
    EXPECT_EQ(6, length);
    EXPECT_FALSE(run<bool>("hasPlcTimestamp", one));
}

TEST_F(SlotWalkLibraryTest, DestructorThatFreesStandsSecond) {
    call<void>(static_cast<IProtocol*>(driver.release()), 1);
    EXPECT_EQ(0, host.multiTask.locksAlive());
    driver = std::make_unique<Protocol_MRTU>();
}

}  // namespace
