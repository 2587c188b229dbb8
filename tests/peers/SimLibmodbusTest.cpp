// The client of libmodbus against the simulator: values are compared with the documented formulas
// and with the simulator's memory.
#include <gtest/gtest.h>
#include <modbus.h>

#include <array>
#include <cerrno>
#include <memory>

#include "sim/Simulator.h"

namespace {

using sim::Area;
using wire::Bytes;

constexpr std::uint8_t kNode = 17;

struct FreeClient {
    void operator()(modbus_t* client) const {
        modbus_close(client);
        modbus_free(client);
    }
};
using Client = std::unique_ptr<modbus_t, FreeClient>;

/// Frames that did not reach the simulator are seen as a time-out after five seconds.
Client connectTo(const std::string& path, int node) {
    Client client(modbus_new_rtu(path.c_str(), 19200, 'N', 8, 1));
    EXPECT_NE(client, nullptr);
    EXPECT_EQ(0, modbus_set_slave(client.get(), node));
    EXPECT_EQ(0, modbus_set_response_timeout(client.get(), 5, 0));
    EXPECT_EQ(0, modbus_connect(client.get())) << modbus_strerror(errno);
    return client;
}

class SimLibmodbusTest : public testing::Test {
  protected:
    void SetUp() override {
        simulator.start();
        client = connectTo(simulator.path(), kNode);
    }

    std::uint32_t item(Area area, int address) const {
        return simulator.slave().get(kNode, area, static_cast<std::uint32_t>(address));
    }

    /// The function code of the latest request.
    int lastFunction() const {
        int function = 0;
        for (const auto& event : simulator.log()) {
            if (event.kind == sim::LineEvent::Kind::Request) function = event.raw[1];
        }
        return function;
    }

    sim::Simulator simulator{
        {.nodes = {{.address = kNode, .longs = sim::LongRange{}}, {.address = 18}}}};
    Client client;
};

TEST_F(SimLibmodbusTest, Function1ReadsCoils) {
    std::array<std::uint8_t, 2000> bits{};
    for (const int count : {1, 7, 8, 9, 2000}) {
        ASSERT_EQ(count, modbus_read_bits(client.get(), 5, count, bits.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ((5 + i + kNode) % 3 == 0, bits[static_cast<std::size_t>(i)]) << count << i;
        }
    }
    EXPECT_EQ(1, lastFunction());
}

TEST_F(SimLibmodbusTest, Function2ReadsDiscreteInputs) {
    std::array<std::uint8_t, 2000> bits{};
    for (const int count : {1, 16, 17, 2000}) {
        ASSERT_EQ(count, modbus_read_input_bits(client.get(), 3, count, bits.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ((3 + i + kNode) % 5 < 2, bits[static_cast<std::size_t>(i)]) << count << i;
        }
    }
    EXPECT_EQ(2, lastFunction());
}

TEST_F(SimLibmodbusTest, Function3ReadsHoldingRegisters) {
    std::array<std::uint16_t, 125> words{};
    for (const int count : {1, 2, 125}) {
        ASSERT_EQ(count, modbus_read_registers(client.get(), 100, count, words.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ(1000 * kNode + 100 + i, words[static_cast<std::size_t>(i)]) << count << i;
        }
    }
    EXPECT_EQ(3, lastFunction());
}

TEST_F(SimLibmodbusTest, Function4ReadsInputRegisters) {
    std::array<std::uint16_t, 125> words{};
    for (const int count : {1, 125}) {
        ASSERT_EQ(count, modbus_read_input_registers(client.get(), 9875, count, words.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ(30000 + 1000 * kNode + 9875 + i, words[static_cast<std::size_t>(i)]);
        }
    }
    EXPECT_EQ(4, lastFunction());
}

TEST_F(SimLibmodbusTest, Function5WritesOneCoil) {
    for (const int on : {1, 0, 1}) {
        ASSERT_EQ(1, modbus_write_bit(client.get(), 9999, on));
        EXPECT_EQ(static_cast<std::uint32_t>(on), item(Area::Coil, 9999));
    }
    EXPECT_EQ(5, lastFunction());
}

TEST_F(SimLibmodbusTest, Function6WritesOneRegister) {
    ASSERT_EQ(1, modbus_write_register(client.get(), 9999, 0xBEEF));
    EXPECT_EQ(0xBEEFU, item(Area::HoldingRegister, 9999));
    EXPECT_EQ(6, lastFunction());
}

TEST_F(SimLibmodbusTest, Function15WritesManyCoils) {
    for (const int count : {1, 8, 9, 1968}) {
        std::array<std::uint8_t, 1968> bits{};
        for (std::size_t i = 0; i < bits.size(); ++i)
            bits[i] = (i * i + 1) % 7 < 3 ? 1 : 0;
        ASSERT_EQ(count, modbus_write_bits(client.get(), 11, count, bits.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ(bits[static_cast<std::size_t>(i)], item(Area::Coil, 11 + i)) << count << i;
        }
    }
    EXPECT_EQ(15, lastFunction());
}

TEST_F(SimLibmodbusTest, Function16WritesManyRegisters) {
    std::array<std::uint16_t, 123> words{};
    for (std::size_t i = 0; i < words.size(); ++i) {
        words[i] = static_cast<std::uint16_t>(0xFF00 - 259 * i);
    }
    for (const int count : {1, 2, 123}) {
        ASSERT_EQ(count, modbus_write_registers(client.get(), 40, count, words.data()));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ(words[static_cast<std::size_t>(i)], item(Area::HoldingRegister, 40 + i));
        }
    }
    EXPECT_EQ(1000U * kNode + 163U, item(Area::HoldingRegister, 163));
    EXPECT_EQ(16, lastFunction());
}

TEST_F(SimLibmodbusTest, WhatIsWrittenIsReadBack) {
    const std::array<std::uint16_t, 3> written{0x0102, 0xFFFE, 0x8000};
    std::array<std::uint16_t, 3> words{};
    ASSERT_EQ(3, modbus_write_registers(client.get(), 7, 3, written.data()));
    ASSERT_EQ(3, modbus_read_registers(client.get(), 7, 3, words.data()));
    EXPECT_EQ(written, words);
}

TEST_F(SimLibmodbusTest, ExceptionsAreUnderstood) {
    std::uint16_t word = 0;
    EXPECT_EQ(-1, modbus_read_registers(client.get(), 10000, 1, &word));
    EXPECT_EQ(EMBXILADD, errno);
    // The client itself refuses too great a count, so the count travels in a raw request.
    const std::array<std::uint8_t, 6> tooMany{kNode, 3, 0, 0, 0, 126};
    std::array<std::uint8_t, MODBUS_RTU_MAX_ADU_LENGTH> reply{};
    ASSERT_GT(modbus_send_raw_request(client.get(), tooMany.data(), 6), 0);
    EXPECT_EQ(5, modbus_receive_confirmation(client.get(), reply.data()));
    EXPECT_EQ(0x83, reply[1]);
    EXPECT_EQ(3, reply[2]);
    // Mask write register, which the simulator does not know.
    EXPECT_EQ(-1, modbus_mask_write_register(client.get(), 0, 0xFFFF, 0));
    EXPECT_EQ(EMBXILFUN, errno);
}

TEST_F(SimLibmodbusTest, BroadcastWritesBothNodes) {
    ASSERT_EQ(0, modbus_set_slave(client.get(), MODBUS_BROADCAST_ADDRESS));
    ASSERT_EQ(0, modbus_set_response_timeout(client.get(), 0, 1));
    EXPECT_EQ(-1, modbus_write_register(client.get(), 1, 4711)) << "nobody may answer";
    EXPECT_EQ(ETIMEDOUT, errno);
    ASSERT_TRUE(simulator.waitForEvents(1, std::chrono::seconds(10)));
    // The next request is served after the broadcast, so its reply says that the write is done.
    ASSERT_EQ(0, modbus_set_slave(client.get(), 18));
    ASSERT_EQ(0, modbus_set_response_timeout(client.get(), 5, 0));
    std::uint16_t word = 0;
    ASSERT_EQ(1, modbus_read_registers(client.get(), 1, 1, &word));
    EXPECT_EQ(4711, word);
    EXPECT_EQ(4711U, item(Area::HoldingRegister, 1));
}

TEST_F(SimLibmodbusTest, LongRegistersAnswerRawRequests) {
    std::array<std::uint8_t, MODBUS_RTU_MAX_ADU_LENGTH> reply{};
    const std::array<std::uint8_t, 6> read{kNode, 3, 0x13, 0x88, 0, 1};
    ASSERT_EQ(8, modbus_send_raw_request(client.get(), read.data(), 6));
    ASSERT_EQ(9, modbus_receive_confirmation(client.get(), reply.data()));
    const std::uint32_t value = 100003U * (1000U * kNode + 5000U);
    EXPECT_EQ((Bytes{kNode, 3, 4, static_cast<std::uint8_t>(value >> 24U),
                     static_cast<std::uint8_t>(value >> 16U & 0xFFU),
                     static_cast<std::uint8_t>(value >> 8U & 0xFFU),
                     static_cast<std::uint8_t>(value & 0xFFU)}),
              Bytes(reply.begin(), reply.begin() + 7));
}

TEST_F(SimLibmodbusTest, ClientsComeAndGo) {
    for (int round = 0; round < 3; ++round) {
        client = connectTo(simulator.path(), kNode);
        std::uint16_t word = 0;
        ASSERT_EQ(1, modbus_read_registers(client.get(), 0, 1, &word)) << round;
        EXPECT_EQ(17000, word);
        client.reset();
    }
}

struct FaultCase {
    const char* what;
    sim::Fault fault;
    int error;
};

TEST_F(SimLibmodbusTest, FaultsAreNoticedAndTheNextRequestSucceeds) {
    for (const FaultCase& each : {
             FaultCase{"silent", {.silent = true}, ETIMEDOUT},
             FaultCase{"wrong CRC", {.wrongCheck = true}, EMBBADCRC},
             FaultCase{"wrong node", {.wrongNode = true}, EMBBADSLAVE},
             FaultCase{"truncated", {.keep = 4}, ETIMEDOUT},
             FaultCase{"busy", {.exception = 6}, EMBXSBUSY},
         }) {
        // Short only where the time has to run out: a busy computer must not change the verdict.
        const std::uint32_t seconds = each.error == ETIMEDOUT ? 1 : 10;
        ASSERT_EQ(0, modbus_set_response_timeout(client.get(), seconds, 0));
        simulator.faults().add(each.fault);
        std::uint16_t word = 0;
        EXPECT_EQ(-1, modbus_read_registers(client.get(), 0, 1, &word)) << each.what;
        EXPECT_EQ(each.error, errno) << each.what << ": " << modbus_strerror(errno);
        modbus_flush(client.get());
        ASSERT_EQ(0, modbus_set_response_timeout(client.get(), 10, 0));
        EXPECT_EQ(1, modbus_read_registers(client.get(), 0, 1, &word)) << each.what;
    }
}

}  // namespace
