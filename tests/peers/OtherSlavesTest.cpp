// The command and the driver against slaves that other people wrote, in both modes.
#include <gtest/gtest.h>

#include "OtherSlavesFixture.h"

namespace {

using peers::OtherSlavesTest;

TEST_P(OtherSlavesTest, EveryAreaHoldsWhatTheSlaveSays) {
    const auto result = mrtu({"read", "3?OUTP?1?boolean-8", "3?INP?100001?boolean-8",
                              "3?HREG?400010?unsignedShort-3", "3?IREG?300001?unsignedShort-2",
                              "3?HREG?400001?unsignedShort-130"});
    EXPECT_EQ(0, result.exitCode);
    std::string block = "3?HREG?400001?unsignedShort-130 = 2000";
    for (int address = 1; address < 130; ++address)
        block.append(",").append(std::to_string(2000 + address));
    EXPECT_EQ(
        "3?OUTP?1?boolean-8 = 1,0,0,1,0,0,1,0\n"
        "3?INP?100001?boolean-8 = 0,1,0,0,0,1,0,0\n"
        "3?HREG?400010?unsignedShort-3 = 2009,2010,2011\n"
        "3?IREG?300001?unsignedShort-2 = 50000,50001\n" +
            block + "\n",
        result.output);
}

TEST_P(OtherSlavesTest, EveryWriteFunctionChangesJustItsItems) {
    // Coils 100, 102, 110 to 113; registers 100, 105 to 107, bit 3 of 110 (2110 is 0x83E).
    EXPECT_EQ(0, mrtu({"write", "3?OUTP?111?boolean-4=1,1,0,1", "3?HREG?400106?short-3=-1,0,1",
                       "3?HREG?400111.3?boolean=0"})
                     .exitCode);
    EXPECT_EQ(0, mrtu({"write", "--set", "forceFunction=05", "--set", "presetFunction=06",
                       "3?OUTP?101?boolean=1", "3?OUTP?103?boolean=0", "3?HREG?400101?short=4711"})
                     .exitCode);
    const peers::Written written = slave_->end();
    EXPECT_EQ((std::vector<int>{1, 0, 0, 0, 0, 1, 0, 0, 1, 0,  //
                                1, 1, 0, 1, 1, 0, 0, 1, 0, 0}),
              written.coils);
    EXPECT_EQ((std::vector<int>{4711, 2101, 2102, 2103, 2104, 65535, 0,    1,    2108, 2109,
                                2102, 2111, 2112, 2113, 2114, 2115,  2116, 2117, 2118, 2119}),
              written.registers);
}

TEST_P(OtherSlavesTest, AnAddressThatTheSlaveLacksIsAnException) {
    const auto result = mrtu({"read", "3?HREG?401001?short"});
    EXPECT_EQ(5, result.exitCode);
    EXPECT_NE(result.output.find("error -6: Exception: Illegal data address"), std::string::npos)
        << result.output;
}

TEST_P(OtherSlavesTest, AnotherNodesRequestStaysUnanswered) {
    const auto result =
        mrtu({"read", "--set", "timeout=100", "--set", "repeat=0", "9?HREG?400001?short"});
    EXPECT_EQ(4, result.exitCode);
    EXPECT_NE(result.output.find("error -4: No response"), std::string::npos) << result.output;
}

INSTANTIATE_TEST_SUITE_P(Peers, OtherSlavesTest, testing::ValuesIn(peers::kPeers), peers::nameOf);

}  // namespace
