// Protocol objects as the factory makes them.
#include <cstring>

#include "description/GetXml.h"
#include "plugin/ProtFactory.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using testing_support::FakeHost;

class ProtocolObjectTest : public ::testing::Test {
  protected:
    ProtocolObjectTest() : protocol(factory().CreateProtocol("MRTU")) {}
    ~ProtocolObjectTest() override { factory().DeleteProtocol(protocol); }

    static IProtocolFactory& factory() {
        return *static_cast<IProtocolFactory*>(GetInterfaceFactory()
                                                   ->CreateInterface("IProtocolFactory")
                                                   ->ConvertTo("IProtocolFactory"));
    }

    FakeHost host;
    driver_test::BoundModule module{host};
    IProtocol* protocol;
};

TEST_F(ProtocolObjectTest, OnlyTheExactNameMakesAProtocol) {
    for (const char* name : {"MRTU ", " MRTU", "mrtu", "MRT", "MRTU2", "", "Modbus RTU"})
        EXPECT_EQ(nullptr, factory().CreateProtocol(name)) << '"' << name << '"';
    EXPECT_NE(nullptr, protocol);
}

TEST_F(ProtocolObjectTest, EveryCallMakesAnotherObject) {
    IProtocol* second = factory().CreateProtocol("MRTU");
    ASSERT_NE(nullptr, second);
    EXPECT_NE(protocol, second);
    EXPECT_EQ(2, host.multiTask.locksAlive()) << "each has a lock of its own";
    factory().DeleteProtocol(second);
    EXPECT_EQ(1, host.multiTask.locksAlive());
}

TEST_F(ProtocolObjectTest, DeletingNullIsHarmless) {
    factory().DeleteProtocol(nullptr);
}

TEST_F(ProtocolObjectTest, AnswersToItsClassAndToEveryGeneration) {
    for (const char* name : {"Protocol_MRTU", "ProtocolBase", "IProtocol7", "IProtocol6",
                             "IProtocol5", "IProtocol4", "IProtocol3", "IProtocol2", "IProtocol"})
        EXPECT_EQ(protocol, protocol->ConvertTo(name)) << name;
    for (const char* name : {"ProtgenProtocol", "IProtocol1", "IProtocol8", "IProtocol0",
                             "iprotocol", "IProtocol ", "IInterface", "protocol_mrtu", ""})
        EXPECT_EQ(nullptr, protocol->ConvertTo(name)) << '"' << name << '"';
}

TEST_F(ProtocolObjectTest, Identity) {
    EXPECT_STREQ("Protocol_MRTU", protocol->GetImpName());
    EXPECT_EQ(100, protocol->GetImpVersion());
    EXPECT_STREQ("MRTU", protocol->GetName());
    EXPECT_STREQ("Modbus RTU", protocol->GetProtocolName());
    EXPECT_EQ(126, protocol->GetProtocolVersion());
    EXPECT_EQ(184, protocol->GetProtocolType());
    EXPECT_STREQ("MRTU", protocol->GetIdent());
    EXPECT_STREQ("MRTU", protocol->GetNextInstanceName());
    EXPECT_EQ(1, protocol->GetLastError());
    EXPECT_STREQ("", protocol->GetLastErrorString());
    EXPECT_FALSE(protocol->IsConverted());
}

TEST_F(ProtocolObjectTest, InfoNamesTheImplementationsInUse) {
    char text[512];
    const int length = protocol->GetInfo(text, sizeof text);
    EXPECT_EQ(
        "Protocol: MRTU (184) v.126\n"
        "Implementation: Protocol_MRTU v.100\n"
        "ProtocolBase v.100\n"
        "ProtLib v.200\n"
        "FakeMultiTask v.7\n"
        "RecordingSerialFactory v.8\n"
        "ISocketFactory v.1\n",
        std::string(text, static_cast<std::size_t>(length)));
}

TEST_F(ProtocolObjectTest, DescriptionBeginsBehindTheMarkerLine) {
    const unsigned char* xml = protocol->GetXml();
    EXPECT_EQ(GetXml_MRTU(), xml);
    const std::string first(reinterpret_cast<const char*>(xml));
    EXPECT_EQ("compressedXML=2224", first);
    const unsigned char* stream = xml + first.size() + 1;
    EXPECT_EQ(0x78, stream[0]) << "no zlib header";
    EXPECT_STREQ("<<ICOM_XML_END>>", reinterpret_cast<const char*>(stream + 2224));
}

TEST_F(ProtocolObjectTest, MarkerLineStandsInFrontOfTheDescription) {
    const std::string marker =
        "<<ICOM_XML_START>>Name=MRTU?FullName=Modbus RTU?Version=126?Platform=KV58_LIN";
    const unsigned char* xml = protocol->GetXml();
    EXPECT_EQ(0, std::memcmp(marker.c_str(), xml - marker.size() - 1, marker.size() + 1));
}

TEST_F(ProtocolObjectTest, TagsStillHeldDieWithTheProtocol) {
    ASSERT_NE(0, protocol->Config(driver_test::configText().c_str()));
    EXPECT_NE(nullptr, protocol->CreateTag("1?HREG?400001?unsignedShort"));
    EXPECT_NE(nullptr, protocol->CreateTag("1?OUTP?1?boolean"));
}

}  // namespace
