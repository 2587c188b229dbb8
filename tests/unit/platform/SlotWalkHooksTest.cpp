// The hooks behind the interface family, called through the table as the engine does.
#include <gtest/gtest.h>

#include "tests/unit/mrtu/DriverTest.h"
#include "tests/unit/platform/ProtocolOperations.h"

namespace {

using driver_test::hex;
using driver_test::rtuFrame;
using slots::call;
using slots::protocolSlot;

class SlotWalkHooksTest : public driver_test::DriverTest {
  protected:
    template <class Result, class... Arguments>
    Result run(const char* operation, Arguments... arguments) {
        return call<Result, Arguments...>(static_cast<IProtocol*>(driver.get()),
                                          protocolSlot(operation), arguments...);
    }
};

TEST_F(SlotWalkHooksTest, HooksStandBehindTheInterfaceFamily) {
    EXPECT_EQ(slots::kDestructors + slots::protocolOperations().size(),
              protocolSlot("CreateTagBase"));
    EXPECT_EQ(protocolSlot("CreateTagBase") + 10, protocolSlot("doReadDatagram"));
}

TEST_F(SlotWalkHooksTest, HooksOfTheFramework) {
    configure("timeout=300 repeat=4");
    auto* made = run<ITag*>("CreateTagBase", static_cast<const char*>("1?OUTP?1?boolean"));
    ASSERT_NE(nullptr, made);
    delete made;
    EXPECT_EQ(1200, run<int>("GetMaxTm", static_cast<const ITag*>(nullptr)));
    const auto* names = run<const char* const*>("tagUriNames");
    EXPECT_STREQ("nodeid", names[0]);
    EXPECT_STREQ("memorytype", names[1]);
    EXPECT_STREQ("arrayindex.subindex", names[2]);
    EXPECT_STREQ("datatype", names[3]);
    EXPECT_EQ(nullptr, names[4]);
}

TEST_F(SlotWalkHooksTest, LimitsOfTheEngine) {
    configure("maxBitOptLen=1999");
    const ProtgenTag* coil = tag("1?OUTP?1?boolean");
    EXPECT_EQ(1999, run<int>("getMaxItemCount", coil, false));
    EXPECT_EQ(1968, run<int>("getMaxItemCount", coil, true));
    EXPECT_EQ(1999, run<int>("getMaxBitCount", coil, false));
    EXPECT_EQ(1968, run<int>("getMaxBitCount", coil, true));
    EXPECT_EQ(1, run<int>("arrayItemByTag"));
}

TEST_F(SlotWalkHooksTest, TransfersOfTheEngine) {
    start();
    const ProtgenTag* word = tag("1?HREG?400001?unsignedShort");
    const ProtgenTag* coil = tag("1?OUTP?1?boolean");
    unsigned char data[2] = {0x34, 0x12};
    const unsigned char* constant = data;
    unsigned char* out = data;

    port.reply(rtuFrame(hex("01 10 00 05 00 01")));
    EXPECT_NE(0, run<int>("doWrite", word, 5, constant, 1));
    port.reply(rtuFrame(hex("01 03 02 56 78")));
    EXPECT_TRUE(run<bool>("doReadBlock", word, 5, out, 1));
    EXPECT_EQ(0x78, data[0]);
    port.reply(rtuFrame(hex("01 0F 00 00 00 01")));
    EXPECT_NE(0, run<int>("doWriteBits", coil, 0, constant, 1));
    port.reply(rtuFrame(hex("01 01 01 01")));
    EXPECT_TRUE(run<bool>("doReadBits", coil, 0, out, 1));
    EXPECT_EQ(0x79, data[0]);
    idal_error_t status = 7;
    EXPECT_FALSE(
        run<bool>("doReadDatagram", static_cast<const ProtgenTag* const*>(&word), 1, out, &status));
}

}  // namespace
