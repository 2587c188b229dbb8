// Faults as a master meets them.
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>

#include "TestMaster.h"
#include "sim/Simulator.h"

namespace sim {
namespace {

using wire::Bytes;

using namespace std::chrono_literals;
using Kind = LineEvent::Kind;
using Clock = std::chrono::steady_clock;

const Bytes kRead0{0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0A};
const Bytes kRead0Reply{0x01, 0x03, 0x02, 0x03, 0xE8, 0xB8, 0xFA};
const Bytes kWrite0{0x01, 0x06, 0x00, 0x00, 0x12, 0x34, 0x84, 0xBD};

class SimulatorFaultTest : public testing::Test {
  protected:
    void SetUp() override { simulator.start(); }

    std::uint32_t register0() const { return simulator.slave().get(1, Area::HoldingRegister, 0); }

    /// The next request is answered as if nothing had happened.
    void expectRecovery(TestMaster& master) {
        master.send(kRead0);
        EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
    }

    Simulator simulator{{.nodes = {{.address = 1}, {.address = 2}}}};
};

struct SpoiltCase {
    const char* what;
    Fault fault;
    Bytes received;
};

TEST_F(SimulatorFaultTest, SpoiltRepliesAndTheRecoveryAfterwards) {
    TestMaster master(simulator.path());
    for (const SpoiltCase& each : {
             SpoiltCase{
                 "wrong CRC", {.wrongCheck = true}, {0x01, 0x03, 0x02, 0x03, 0xE8, 0x47, 0x05}},
             SpoiltCase{
                 "wrong node", {.wrongNode = true}, {0x02, 0x03, 0x02, 0x03, 0xE8, 0xFC, 0xFA}},
             SpoiltCase{"truncated", {.keep = 4}, {0x01, 0x03, 0x02, 0x03}},
             SpoiltCase{"exception", {.exception = 4}, {0x01, 0x83, 0x04, 0x40, 0xF3}},
             SpoiltCase{"noise",
                        {.noise = {0x00, 0xFF}},
                        {0x00, 0xFF, 0x01, 0x03, 0x02, 0x03, 0xE8, 0xB8, 0xFA}},
             SpoiltCase{"replaced", {.replacement = Bytes{0xAA, 0x55}}, {0xAA, 0x55}},
         }) {
        simulator.faults().add(each.fault);
        master.send(kRead0);
        EXPECT_EQ(each.received, master.receive(each.received.size())) << each.what;
        expectRecovery(master);
    }
}

TEST_F(SimulatorFaultTest, SilentForTheNextRequests) {
    simulator.faults().add({.times = 2, .silent = true});
    TestMaster master(simulator.path());
    master.send(kWrite0);
    ASSERT_TRUE(simulator.waitForEvents(1, 10s));
    master.send(kWrite0);
    ASSERT_TRUE(simulator.waitForEvents(2, 10s));
    expectRecovery(master);
    EXPECT_EQ(1000U, register0()) << "a silent node does not execute";
    EXPECT_EQ(4U, simulator.log().size());
}

TEST_F(SimulatorFaultTest, ALostReplyIsExecuted) {
    simulator.faults().add({.keep = 0});
    TestMaster master(simulator.path());
    master.send(kWrite0);
    master.send(kWrite0);
    EXPECT_EQ(kWrite0, master.receive(kWrite0.size()));
    EXPECT_EQ(0x1234U, register0());
}

TEST_F(SimulatorFaultTest, ADemandedExceptionIsNotExecuted) {
    simulator.faults().add({.exception = 6});
    TestMaster master(simulator.path());
    master.send(kWrite0);
    const Bytes reply = master.receive(5);
    ASSERT_EQ(5U, reply.size());
    EXPECT_EQ(0x86, reply[1]);
    EXPECT_EQ(6, reply[2]);
    EXPECT_EQ(1000U, register0());
}

TEST_F(SimulatorFaultTest, AFaultWaitsForItsNode) {
    simulator.faults().add({.node = 2, .exception = 4});
    TestMaster master(simulator.path());
    expectRecovery(master);
    EXPECT_FALSE(simulator.faults().empty());
    master.send(Bytes{0x02, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x39});
    EXPECT_EQ(0x83, master.receive(5)[1]);
}

TEST_F(SimulatorFaultTest, BroadcastsAndForeignNodesUseNoFaultUp) {
    simulator.faults().add({.exception = 4});
    TestMaster master(simulator.path());
    master.send(Bytes{0x00, 0x06, 0x00, 0x07, 0x00, 0x2A, 0xB8, 0x05});
    ASSERT_TRUE(simulator.waitForEvents(1, 10s));
    EXPECT_FALSE(simulator.faults().empty());
    master.send(kRead0);
    EXPECT_EQ((Bytes{0x01, 0x83, 0x04, 0x40, 0xF3}), master.receive(5));
}

TEST_F(SimulatorFaultTest, DelayHoldsTheReplyBackAtLeastThatLong) {
    simulator.faults().add({.delayMs = 60});
    TestMaster master(simulator.path());
    const auto sent = Clock::now();
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
    EXPECT_GE(Clock::now() - sent, 60ms);
}

TEST_F(SimulatorFaultTest, DripSendsEveryByteWithItsGaps) {
    simulator.faults().add({.dripBytes = 3, .dripGapMs = 20});
    TestMaster master(simulator.path());
    const auto sent = Clock::now();
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
    EXPECT_GE(Clock::now() - sent, 40ms) << "three pieces, two gaps";
}

TEST_F(SimulatorFaultTest, StopDoesNotWaitForADelay) {
    simulator.faults().add({.delayMs = 3600000});
    TestMaster master(simulator.path());
    master.send(kRead0);
    ASSERT_TRUE(simulator.waitForEvents(1, 10s));
    simulator.stop();
    EXPECT_TRUE(master.seesHangUp());
    EXPECT_EQ(1U, simulator.log().size());
}

TEST_F(SimulatorFaultTest, StopDoesNotWaitForADrip) {
    simulator.faults().add({.dripBytes = 1, .dripGapMs = 3600000});
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ(Bytes{0x01}, master.receive(1));
    simulator.stop();
    EXPECT_TRUE(master.seesHangUp());
}

TEST_F(SimulatorFaultTest, HangUpEndsTheLineUntilTheNextStart) {
    simulator.faults().add({.hangUp = true});
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_TRUE(master.seesHangUp());
    EXPECT_FALSE(std::filesystem::exists(simulator.device()));
    EXPECT_EQ(Simulator::End::HungUp, simulator.wait());
    EXPECT_EQ(Kind::HangUp, simulator.log().back().kind);
    simulator.start();
    TestMaster again(simulator.path());
    expectRecovery(again);
}

TEST_F(SimulatorFaultTest, AHangUpMayCutAReply) {
    simulator.faults().add({.keep = 2, .dripBytes = 2, .dripGapMs = 1000, .hangUp = true});
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ((Bytes{0x01, 0x03}), master.receive(2));
    EXPECT_TRUE(master.seesHangUp());
}

TEST_F(SimulatorFaultTest, ASilentHangUpDoesNotExecute) {
    simulator.faults().add({.silent = true, .hangUp = true});
    TestMaster master(simulator.path());
    master.send(kWrite0);
    EXPECT_TRUE(master.seesHangUp());
    EXPECT_EQ(1000U, register0());
}

TEST_F(SimulatorFaultTest, StartAfterAHangUpNeedsNoWait) {
    simulator.faults().add({.hangUp = true});
    TestMaster master(simulator.path());
    master.send(kRead0);
    ASSERT_TRUE(simulator.waitForEvents(2, 10s));
    simulator.start();
    TestMaster again(simulator.path());
    expectRecovery(again);
}

}  // namespace
}  // namespace sim
