// Numbers in every byte order and texts, against slaves that other people wrote and against their
// own functions for them. An order is spelled as the bytes travel, A the most significant.
#include <modbus.h>

#include <cstdint>

#include "OtherSlavesFixture.h"

namespace {

using peers::OtherSlavesTest;

const std::vector<std::string> kOrders32{"ABCD", "CDAB", "DCBA", "BADC"};
const std::vector<std::string> kOrders64{"ABCDEFGH", "GHEFCDAB", "HGFEDCBA", "BADCFEHG",
                                         "EFGHABCD", "CDABGHEF", "DCBAHGFE", "FEHGBADC"};
constexpr int kWritten = 100;  ///< The first register that the slaves tell about at their end.

/// The number whose bytes travel as `wire` in this order.
std::uint64_t numberOf(const std::string& order, const std::vector<std::uint8_t>& wire) {
    std::uint64_t number = 0;
    for (std::size_t at = 0; at < order.size(); ++at) {
        const std::size_t below = order.size() - 1 - static_cast<std::size_t>(order[at] - 'A');
        number |= std::uint64_t{wire[at]} << (8U * below);
    }
    return number;
}

/// What the registers hold that carry 0x0A0B0C0D... in this order.
std::vector<int> lettersOf(const std::string& order) {
    std::vector<int> registers;
    for (std::size_t at = 0; at < order.size(); at += 2)
        registers.push_back((order[at] - 'A' + 0x0A) << 8 | (order[at + 1] - 'A' + 0x0A));
    return registers;
}

std::string registerUri(int index, const std::string& type) {
    return "3?HREG?" + std::to_string(400001 + index) + "?" + type;
}

std::vector<int> someOf(const std::vector<int>& registers, std::size_t count) {
    return {registers.begin(), registers.begin() + static_cast<std::ptrdiff_t>(count)};
}

using OtherByteOrdersTest = OtherSlavesTest;

TEST_P(OtherByteOrdersTest, EveryByteOrderReadsWhatTheSlaveHolds) {
    std::vector<std::string> words{"read"};
    std::string expected;
    for (const auto& [type, orders] :
         {std::pair{"unsignedInt@", kOrders32}, std::pair{"uint64@", kOrders64}}) {
        for (const std::string& order : orders) {
            words.push_back(registerUri(0, type + order));
            // Registers 0 to 3 hold 2000 to 2003.
            const std::uint64_t number =
                numberOf(order, {0x07, 0xD0, 0x07, 0xD1, 0x07, 0xD2, 0x07, 0xD3});
            expected += words.back() + " = " + std::to_string(number) + "\n";
        }
    }
    EXPECT_EQ(expected, mrtu(words).output);
}

TEST_P(OtherByteOrdersTest, EveryOrderOf32BitsArrivesAsItsNameSays) {
    std::vector<std::string> words{"write", "--verify"};
    std::vector<int> expected;
    for (std::size_t i = 0; i < kOrders32.size(); ++i) {
        words.push_back(registerUri(kWritten + 2 * static_cast<int>(i),
                                    "unsignedInt@" + kOrders32[i] + "=0x0A0B0C0D"));
        for (const int each : lettersOf(kOrders32[i]))
            expected.push_back(each);
    }
    const auto result = mrtu(words);
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ(expected, someOf(slave_->end().registers, expected.size()));
}

/// The slaves tell about twenty registers: five numbers of 64 bits.
TEST_P(OtherByteOrdersTest, EveryOrderOf64BitsArrivesAsItsNameSays) {
    for (const std::size_t from : {0U, 4U}) {
        std::vector<std::string> words{"write", "--verify"};
        std::vector<int> expected;
        for (std::size_t i = 0; i < 4; ++i) {
            const std::string& order = kOrders64[from + i];
            words.push_back(registerUri(kWritten + 4 * static_cast<int>(i),
                                        "uint64@" + order + "=0x0A0B0C0D0E0F1011"));
            for (const int each : lettersOf(order))
                expected.push_back(each);
        }
        const auto result = mrtu(words);
        EXPECT_EQ(0, result.exitCode) << result.output;
        EXPECT_EQ(expected, someOf(slave_->end().registers, expected.size()));
        slave_ = GetParam().make();
    }
}

TEST_P(OtherByteOrdersTest, ArraysAndTextsKeepTheirOrder) {
    const auto result =
        mrtu({"write", "--verify", registerUri(100, "unsignedInt-2@ABCD=1,2"),
              registerUri(104, "string-4@AB=PUMP"), registerUri(106, "string-4@BA=PUMP"),
              registerUri(108, "short-2@BA=1,2"), registerUri(110, "short@AB=1")});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ((std::vector<int>{0, 1, 0, 2, 0x5055, 0x4D50, 0x5550, 0x504D, 0x0100, 0x0200, 1}),
              someOf(slave_->end().registers, 11));
}

/// 123456.75 as a float is 0x47F12060, as a double 0x40FE240C00000000.
std::vector<std::string> realsInTheUsualOrders() {
    return {"write",
            "--verify",
            registerUri(100, "float@ABCD=123456.75"),
            registerUri(102, "float@CDAB=123456.75"),
            registerUri(104, "float@DCBA=123456.75"),
            registerUri(106, "float@BADC=123456.75"),
            registerUri(108, "double@ABCDEFGH=123456.75"),
            registerUri(112, "double@GHEFCDAB=123456.75")};
}

TEST_P(OtherByteOrdersTest, LibmodbusTakesTheRealsForTheSame) {
    const auto result = mrtu(realsInTheUsualOrders());
    EXPECT_EQ(0, result.exitCode) << result.output;
    const std::vector<int> found = slave_->end().registers;
    const std::vector<std::uint16_t> held(found.begin(), found.end());
    EXPECT_EQ(123456.75F, modbus_get_float_abcd(held.data()));
    EXPECT_EQ(123456.75F, modbus_get_float_cdab(held.data() + 2));
    EXPECT_EQ(123456.75F, modbus_get_float_dcba(held.data() + 4));
    EXPECT_EQ(123456.75F, modbus_get_float_badc(held.data() + 6));
    EXPECT_EQ(0x40FE240C00000000, MODBUS_GET_INT64_FROM_INT16(held.data(), 8));
}

TEST_P(OtherByteOrdersTest, PymodbusTakesTheRealsForTheSame) {
    const auto result = mrtu(realsInTheUsualOrders());
    EXPECT_EQ(0, result.exitCode) << result.output;
    std::vector<std::string> words{"/usr/bin/python3", PEERS_DIRECTORY "/pymodbus_reals.py"};
    for (const int held : slave_->end().registers)
        words.push_back(std::to_string(held));
    EXPECT_EQ(
        "abcd 123456.75\ncdab 123456.75\ndcba 123456.75\nbadc 123456.75\n"
        "abcdefgh 123456.75\nghefcdab 123456.75\n",
        peers::runProgram(words).output);
}

INSTANTIATE_TEST_SUITE_P(Peers, OtherByteOrdersTest, testing::ValuesIn(peers::kPeers),
                         peers::nameOf);

}  // namespace
