// Node addresses, changed while running.
#include "tests/unit/mrtu/OverrideFixture.h"

namespace {

using driver_test::Bytes;
using driver_test::hex;
using driver_test::kNode;
using driver_test::kWord;
using driver_test::rtuFrame;
using driver_test::toHex;
using testing_support::rtuMessage;

using NodeOverrideTest = driver_test::OverrideFixture;

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

}  // namespace
