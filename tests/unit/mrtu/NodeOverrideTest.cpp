// Node addresses and Modicon mode, changed while running.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::toHex;
using testing_support::rtuMessage;

const char* const kNode = "1?NO?0?unsignedByte";
const char* const kWord = "1?HREG?400011?short";

class NodeOverrideTest : public DriverTest {
  protected:
    /// Node and address of the request that a read of one register at `index` sends.
    std::string lineHead(const std::string& uri, int index = 10) {
        port.forget();
        port.silence();
        unsigned char data[2];
        EXPECT_FALSE(driver->doReadBlock(tag(uri), index, data, 1));
        return port.sent().empty() ? "" : toHex(testing_support::firstOf(port.sent()[0], 4));
    }
    std::string writtenHead(const std::string& uri, int index = 10) {
        port.forget();
        port.silence();
        const unsigned char data[] = {0, 0};
        EXPECT_EQ(0, driver->doWrite(tag(uri), index, data, 1));
        return port.sent().empty() ? "" : toHex(testing_support::firstOf(port.sent()[0], 4));
    }
};

TEST_F(NodeOverrideTest, ReadsTheNodeItselfUntilOverridden) {
    start();
    EXPECT_EQ(1, readByte(kNode));
    EXPECT_EQ(44, readByte("300?NO?0?unsignedByte")) << "one byte of the number";
    EXPECT_NE(0, writeByte(kNode, 200));
    EXPECT_EQ(200, readByte(kNode));
    EXPECT_EQ(2, readByte("2?NO?0?unsignedByte"));
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(NodeOverrideTest, TakesEffectOnTheNextRequest) {
    start("repeat=0");
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
    writeByte(kNode, 9);
    EXPECT_EQ("09 03 00 0A", lineHead(kWord));
    EXPECT_EQ("09 10 00 0A", writtenHead(kWord));
    EXPECT_EQ("02 03 00 0A", lineHead("2?HREG?400011?short"));
}

TEST_F(NodeOverrideTest, ReplyMustComeFromTheOverriddenNode) {
    start("repeat=0");
    writeByte(kNode, 9);
    port.reply(rtuFrame(hex("01 03 02 12 34")));
    EXPECT_FALSE(read(tag(kWord), 1));
    expectError(-6, "Incorrect node address in response");
}

TEST_F(NodeOverrideTest, OverrideIsPersistedAndOwnNumberRemovesIt) {
    start();
    writeByte(kNode, 9);
    EXPECT_EQ("text:9", host.stored.describe("MRTU", "tempNode1"));
    writeByte(kNode, 1);
    EXPECT_EQ("none", host.stored.describe("MRTU", "tempNode1"));
    EXPECT_EQ("id 1 -> 1\n", command("getid")) << "the pair stays listed";
}

TEST_F(NodeOverrideTest, SurvivesARestart) {
    start("repeat=0");
    writeByte(kNode, 9);
    restartDriver();
    start("repeat=0");
    EXPECT_EQ("09 03 00 0A", lineHead(kWord));
}

TEST_F(NodeOverrideTest, OverrideToTwoHundredFiftyFiveDisables) {
    start();
    writeByte(kNode, 255);
    EXPECT_FALSE(read(tag(kWord), 1));
    expectError(-10, "Node disabled");
    plantError();
    EXPECT_EQ(0, write(tag(kWord), hex("34 12"), 1));
    expectError(-10, "Node disabled");
    EXPECT_TRUE(port.sent().empty());
    EXPECT_EQ(0, port.looks());
    writeByte(kNode, 1);
    port.reply(rtuFrame(hex("01 03 02 12 34")));
    EXPECT_TRUE(read(tag(kWord), 1));
}

TEST_F(NodeOverrideTest, OverrideToZeroRefusesReadsAndBroadcastsWrites) {
    start("repeat=0");
    writeByte(kNode, 0);
    EXPECT_FALSE(read(tag(kWord), 1));
    expectError(-10, "Broadcast request");
    EXPECT_TRUE(port.sent().empty());
    EXPECT_EQ("00 10 00 0A", writtenHead(kWord));
    expectError(-4, "No response");
}

TEST_F(NodeOverrideTest, LowByteOfALargeReplacementGoesOut) {
    start("repeat=0");
    command("setid 1 300");
    EXPECT_EQ("2C 03 00 0A", lineHead(kWord));
    command("setid 1 511");
    EXPECT_FALSE(read(tag(kWord), 1));
    expectError(-10, "Node disabled");
    command("setid 1 256");
    EXPECT_FALSE(read(tag(kWord), 1));
    expectError(-10, "Broadcast request");
}

TEST_F(NodeOverrideTest, RefusedStorageKeepsTheOverrideInMemory) {
    start("repeat=0");
    host.storage.refuseWrites();
    EXPECT_NE(0, writeByte(kNode, 9));
    EXPECT_EQ("09 03 00 0A", lineHead(kWord));
    restartDriver();
    start("repeat=0");
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
}

TEST_F(NodeOverrideTest, SectionIsTheIdent) {
    driver->SetIdent("line A");
    start();
    writeByte(kNode, 9);
    EXPECT_EQ("text:9", host.stored.describe("line A", "tempNode1"));
    EXPECT_EQ("none", host.stored.describe("MRTU", "tempNode1"));
}

class ModiconModeTest : public NodeOverrideTest {};

const char* const kMode = "1?NP_Mode?0?boolean";

TEST_F(ModiconModeTest, DefaultIsTheConfiguredOne) {
    start("Node2::model=2 Node3::model=3 Node4::model=4");
    EXPECT_EQ(1, readByte(kMode));
    EXPECT_EQ(0, readByte("2?NP_Mode?0?boolean"));
    EXPECT_EQ(1, readByte("3?NP_Mode?0?boolean"));
    EXPECT_EQ(0, readByte("4?NP_Mode?0?boolean"));
}

TEST_F(ModiconModeTest, SwitchedOffAddsOne) {
    start("repeat=0");
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
    EXPECT_NE(0, writeByte(kMode, 0));
    EXPECT_EQ(0, readByte(kMode));
    EXPECT_EQ("01 03 00 0B", lineHead(kWord));
    EXPECT_EQ("01 10 00 0B", writtenHead(kWord));
    writeByte(kMode, 1);
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
}

TEST_F(ModiconModeTest, SwitchedOnSubtractsOne) {
    start("repeat=0 model=2");
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
    EXPECT_NE(0, writeByte(kMode, 0x80)) << "anything but zero is on";
    EXPECT_EQ(1, readByte(kMode));
    EXPECT_EQ("01 03 00 09", lineHead(kWord));
    EXPECT_EQ("01 10 00 09", writtenHead(kWord));
}

TEST_F(ModiconModeTest, ShiftWrapsAtSixteenBits) {
    start("repeat=0 Node2::model=2");
    writeByte(kMode, 0);
    EXPECT_EQ("01 03 00 00", lineHead(kWord, 65535));
    EXPECT_EQ("01 10 00 00", writtenHead(kWord, 65535));
    writeByte("2?NP_Mode?0?boolean", 1);
    EXPECT_EQ("02 03 FF FF", lineHead("2?HREG?400000?short", 0));
    EXPECT_EQ("02 10 FF FF", writtenHead("2?HREG?400000?short", 0));
}

TEST_F(ModiconModeTest, AcknowledgeIsComparedWithTheShiftedAddress) {
    start("repeat=0");
    writeByte(kMode, 0);
    port.reply(rtuFrame(hex("01 10 00 0B 00 01")));
    EXPECT_NE(0, write(tag(kWord), hex("34 12"), 1));
    port.reply(rtuFrame(hex("01 10 00 0A 00 01")));
    EXPECT_EQ(0, write(tag(kWord), hex("34 12"), 1));
    expectError(-6, "Incorrect offset in response");
}

TEST_F(ModiconModeTest, IsPersistedPerNode) {
    start();
    EXPECT_NE(0, writeByte("3?NP_Mode?0?boolean", 0));
    EXPECT_EQ("bool:false", host.stored.describe("MRTU", "node3_ModiconMode"));
    writeByte("3?NP_Mode?0?boolean", 7);
    EXPECT_EQ("bool:true", host.stored.describe("MRTU", "node3_ModiconMode"));
    EXPECT_EQ(1, readByte(kMode));
}

TEST_F(ModiconModeTest, PersistedModeWinsOverTheConfiguredOne) {
    host.stored.put("MRTU", "node1_ModiconMode", false);
    start("repeat=0");
    EXPECT_EQ("01 03 00 0B", lineHead(kWord));
    EXPECT_EQ(0, readByte(kMode));
}

TEST_F(ModiconModeTest, StorageIsAskedOnlyOnce) {
    start("repeat=0");
    lineHead(kWord);
    host.storage.forget();
    host.stored.put("MRTU", "node1_ModiconMode", false);
    EXPECT_EQ("01 03 00 0A", lineHead(kWord));
    EXPECT_TRUE(host.storage.calls().empty());
}

/// A node's one-based flag can only be cleared, so a node of model "1" below a configuration of
/// model "2" counts as zero-based, while its addresses are those of model "1".
TEST_F(ModiconModeTest, InheritedFlagDecidesTheDirection) {
    start("repeat=0 model=2 Node1::model=1");
    EXPECT_EQ(0, readByte(kMode));
    EXPECT_EQ(10, tag(kWord)->offset());
    writeByte(kMode, 1);
    EXPECT_EQ("01 03 00 09", lineHead(kWord));
}

}  // namespace
