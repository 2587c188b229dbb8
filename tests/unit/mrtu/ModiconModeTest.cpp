// Modicon mode, changed while running.
#include "tests/unit/mrtu/OverrideFixture.h"

namespace {

using driver_test::hex;
using driver_test::kWord;
using driver_test::rtuFrame;

using ModiconModeTest = driver_test::OverrideFixture;

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
