// The plug-in file driven the way a host does it, step by step, with nothing but platform/.
#include <gtest/gtest.h>

#include "platform/IProtocol.h"
#include "tests/support/FakeHost.h"
#include "tests/support/Replies.h"
#include "tests/unit/plugin/LoadedLibrary.h"

namespace {

using testing_support::bitsReply;
using testing_support::Bytes;
using testing_support::exceptionReply;
using testing_support::FakeHost;
using testing_support::hex;
using testing_support::registersReply;
using testing_support::rtuFrame;
using testing_support::rtuMessage;
using testing_support::ScriptedPort;
using testing_support::toHex;
using testing_support::writeReply;

constexpr const char* kConfig =
    "CfgVer=1 defNodeId=1 model=3 uart=com2 baudrate=19200 parity=even stopbits=1 mode=RS-485 "
    "txMode=RTU timeout=500";

class LoadedOrderOfUseTest : public ::testing::Test {
  protected:
    LoadedOrderOfUseTest() {
        host.serialFactory.offer("com2", port);
        if (library.module()->Init(&host) == 0) ADD_FAILURE() << library.module()->GetLastError();
        protocol = library.protocols()->CreateProtocol("MRTU");
    }

    ~LoadedOrderOfUseTest() override {
        library.protocols()->DeleteProtocol(protocol);
        library.module()->Close();
        EXPECT_EQ(0, host.held());
        EXPECT_EQ(0, host.multiTask.locksAlive());
    }

    void start() {
        ASSERT_NE(0, protocol->Config(kConfig)) << protocol->GetLastErrorString();
        ASSERT_NE(0, protocol->Start()) << protocol->GetLastErrorString();
    }

    /// The tag's value in run-time form after one request.
    std::string valueOf(const char* uri, const Bytes& reply) {
        ITag* tag = protocol->CreateTag(uri);
        if (tag == nullptr) return protocol->GetLastErrorString();
        port.reply(rtuFrame(reply));
        Bytes value(static_cast<std::size_t>(tag->GetVarLength()), 0xEE);
        const int done = protocol->Read(tag, value.data());
        protocol->FreeTag(tag);
        return done != 0 ? toHex(value) : protocol->GetLastErrorString();
    }

    FakeHost host;
    ScriptedPort port{host.multiTask};
    LoadedLibrary library;
    IProtocol* protocol = nullptr;
};

TEST_F(LoadedOrderOfUseTest, OpensTheLineAsConfigured) {
    start();
    EXPECT_EQ(std::vector<std::string>{"com2"}, host.serialFactory.opened());
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{19200, 1, 8, 1, 1}}), port.settings());
    EXPECT_NE(0, protocol->Stop());
    EXPECT_EQ(1, host.serialFactory.released());
}

TEST_F(LoadedOrderOfUseTest, ReadsATagFromEveryArea) {
    start();
    EXPECT_EQ("01", valueOf("1?OUTP?3?boolean", bitsReply(1, 1, {true})));
    EXPECT_EQ("01 00 01", valueOf("1?INP?100011?boolean-3", bitsReply(1, 2, {true, false, true})));
    EXPECT_EQ("34 12", valueOf("1?HREG?400010?unsignedShort", registersReply(1, 3, {0x1234})));
    EXPECT_EQ("00 00 80 3F",
              valueOf("1?IREG?300001?float(swap4,swap2)", registersReply(1, 4, {0x3F80, 0x0000})));
    EXPECT_EQ("44 33 22 11", valueOf("1?LONG?5?int", hex("01 03 04 11 22 33 44")));
    EXPECT_EQ("01", valueOf("1?HREG?400010.3?boolean", registersReply(1, 3, {0x0008})));
    ASSERT_EQ(6U, port.sent().size());
    EXPECT_EQ("01 01 00 02 00 01", toHex(rtuMessage(port.sent()[0])));
    EXPECT_EQ("01 02 00 0A 00 03", toHex(rtuMessage(port.sent()[1])));
    EXPECT_EQ("01 03 00 09 00 01", toHex(rtuMessage(port.sent()[2])));
    EXPECT_EQ("01 04 00 00 00 02", toHex(rtuMessage(port.sent()[3])));
    EXPECT_EQ("01 03 00 05 00 01", toHex(rtuMessage(port.sent()[4])));
}

TEST_F(LoadedOrderOfUseTest, WritesATag) {
    start();
    ITag* tag = protocol->CreateTag("1?HREG?400001?unsignedShort");
    ASSERT_NE(nullptr, tag);
    port.reply(rtuFrame(writeReply(1, 16, 0, 1)));
    const unsigned char value[] = {0x34, 0x12};
    EXPECT_NE(0, protocol->Write(tag, value)) << protocol->GetLastErrorString();
    EXPECT_EQ("01 10 00 00 00 01 02 12 34", toHex(rtuMessage(port.sent().at(0))));
}

TEST_F(LoadedOrderOfUseTest, ReportsFailuresThroughTheErrorState) {
    start();
    EXPECT_EQ("Tag URI error: 1?HREG?400001 - there must be 4 tag specification fields",
              valueOf("1?HREG?400001", {}));
    EXPECT_EQ(-1, protocol->GetLastError());
    EXPECT_EQ("Exception: Illegal data address",
              valueOf("1?HREG?400001?short", exceptionReply(1, 3, 2)));
    EXPECT_EQ(-6, protocol->GetLastError());
}

TEST_F(LoadedOrderOfUseTest, UnknownProtocolGivesNull) {
    EXPECT_EQ(nullptr, library.protocols()->CreateProtocol("MTCP"));
}

TEST_F(LoadedOrderOfUseTest, SeveralChannelsShareOneModule) {
    ScriptedPort second{host.multiTask};
    host.serialFactory.offer("com3", second);
    ASSERT_EQ(1, library.module()->Init(&host));
    IProtocol* other = library.protocols()->CreateProtocol("MRTU");
    ASSERT_NE(0, other->Config("CfgVer=1 defNodeId=1 uart=com3 baudrate=9600 parity=none bits=7 "
                               "stopbits=2 mode=RS-232 txMode=ASCII"));
    ASSERT_NE(0, other->Start());
    start();
    EXPECT_EQ((std::vector<ScriptedPort::Settings>{{9600, 0, 7, 2, 0}}), second.settings());
    library.protocols()->DeleteProtocol(other);
    library.module()->Close();
    EXPECT_EQ("34 12", valueOf("1?HREG?400001?short", registersReply(1, 3, {0x1234})));
}

TEST_F(LoadedOrderOfUseTest, DescriptionIsReachable) {
    EXPECT_STREQ("compressedXML=2224", reinterpret_cast<const char*>(protocol->GetXml()));
}

}  // namespace
