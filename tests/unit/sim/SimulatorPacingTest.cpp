// Time on the simulated line. What is asserted is order, content and "not before": a loaded machine
// may be late with everything.
#include <gtest/gtest.h>

#include <string>

#include "TestMaster.h"
#include "sim/Simulator.h"

namespace sim {
namespace {

using namespace std::chrono_literals;
using wire::Bytes;
using wire::Mode;
using Kind = LineEvent::Kind;

const Bytes kRead0{0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0A};
const Bytes kRead0Reply{0x01, 0x03, 0x02, 0x03, 0xE8, 0xB8, 0xFA};
const Bytes kReadNode2{0x02, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x39};
const Bytes kReadNode2Reply{0x02, 0x03, 0x02, 0x07, 0xD0, 0xFF, 0xE8};
const Bytes kUnknown{0x01, 0x07, 0x41, 0xE2};

// 8 characters of a request take 80 ms, the silence 35 ms, 7 characters of a reply 70 ms.
constexpr wire::LineRate kTenMilliseconds{.baud = 1000, .characterBits = 10};

Bytes operator+(Bytes a, const Bytes& b) {
    a.insert(a.end(), b.begin(), b.end());
    return a;
}

std::string told(const Simulator& simulator) {
    std::string all;
    for (const LineEvent& event : simulator.log())
        all += std::string(nameOf(event.kind)) + ' ' +
               std::to_string(event.raw.empty() ? 0 : event.raw[0]) + '\n';
    return all;
}

/// Sends, waits for the reply and tells how long that took.
Nanos exchange(TestMaster& master, const Bytes& request, const Bytes& reply) {
    const Instant sent = Clock::now();
    master.send(request);
    EXPECT_EQ(reply, master.receive(reply.size()));
    return Clock::now() - sent;
}

TEST(SimulatorPacingTest, RequestSilenceAndReplyTakeTheirTime) {
    Simulator simulator({.rate = kTenMilliseconds});
    simulator.start();
    TestMaster master(simulator.path());
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 80ms + 35ms + 70ms);
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 80ms + 35ms + 70ms);
}

TEST(SimulatorPacingTest, AsciiKeepsNoSilence) {
    Simulator simulator({.mode = Mode::Ascii, .rate = {.baud = 10000, .characterBits = 10}});
    simulator.start();
    TestMaster master(simulator.path());
    const Instant sent = Clock::now();
    master.send(":010300000001FB\r\n");
    EXPECT_EQ(":01030203E80F\r\n", master.receiveText(15));
    EXPECT_GE(Clock::now() - sent, 17ms + 15ms);
}

TEST(SimulatorPacingTest, CharactersComeOneAfterTheOther) {
    Simulator simulator({.rate = kTenMilliseconds});
    simulator.start();
    TestMaster master(simulator.path());
    const Instant sent = Clock::now();
    master.send(kRead0);
    for (std::size_t i = 0; i < kRead0Reply.size(); ++i) {
        EXPECT_EQ(Bytes{kRead0Reply[i]}, master.receive(1));
        EXPECT_GE(Clock::now() - sent, 115ms + 10ms * (i + 1));
    }
}

TEST(SimulatorPacingTest, ALongReplyArrivesWholeAtAFastRate) {
    Simulator simulator({.rate = {.baud = 921600, .characterBits = 10}});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(Bytes{0x01, 0x03, 0x00, 0x00, 0x00, 0x7D, 0x85, 0xEB});
    EXPECT_EQ(255U, master.receive(255).size());
    exchange(master, kRead0, kRead0Reply);
}

TEST(SimulatorPacingTest, TheTurnaroundIsKeptByItsNodeOnly) {
    Simulator simulator({.nodes = {{.address = 1, .turnaround = {.least = 60ms}}, {.address = 2}}});
    simulator.start();
    TestMaster master(simulator.path());
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 60ms);
    master.send(kRead0);
    master.send(kReadNode2);
    EXPECT_EQ(kReadNode2Reply + kRead0Reply, master.receive(14))
        << "who is slow keeps nobody else waiting";
}

TEST(SimulatorPacingTest, RepliesOfTwoNodesStandApartByTheSilence) {
    Simulator simulator({.nodes = {{.address = 1}, {.address = 2}}, .rate = kTenMilliseconds});
    simulator.start();
    TestMaster master(simulator.path());
    const Instant sent = Clock::now();
    master.send(kRead0 + kReadNode2);
    EXPECT_EQ(kRead0Reply + kReadNode2Reply, master.receive(14));
    EXPECT_GE(Clock::now() - sent, 80ms + 35ms + 70ms + 35ms + 70ms);
}

TEST(SimulatorPacingTest, TheTurnaroundGrows) {
    Simulator simulator({.nodes = {{.turnaround = {.least = 10ms, .most = 1h, .growth = 40ms}}}});
    simulator.start();
    TestMaster master(simulator.path());
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 10ms);
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 50ms);
    EXPECT_GE(exchange(master, kRead0, kRead0Reply), 90ms);
}

TEST(SimulatorPacingTest, WhatComesWhileItIsBusyIsAnsweredInTurn) {
    Simulator simulator({.nodes = {{.turnaround = {.least = 50ms}}}});
    simulator.start();
    TestMaster master(simulator.path());
    const Bytes read5{0x01, 0x03, 0x00, 0x05, 0x00, 0x01, 0x94, 0x0B};
    const Bytes read5Reply{0x01, 0x03, 0x02, 0x03, 0xED, 0x78, 0xF9};
    const Instant sent = Clock::now();
    master.send(kRead0);
    master.send(read5);
    EXPECT_EQ(kRead0Reply + read5Reply, master.receive(14));
    EXPECT_GE(Clock::now() - sent, 100ms);
    EXPECT_EQ("request 1\nrequest 1\nreply 1\nreply 1\n", told(simulator));
}

TEST(SimulatorPacingTest, WhatComesWhileItIsBusyMayBeLost) {
    Simulator simulator(
        {.nodes = {{.turnaround = {.least = 300ms}}, {.address = 2}}, .losesWhileBusy = true});
    simulator.start();
    TestMaster master(simulator.path());
    // In one piece: nothing but their order decides.
    master.send(kRead0 + kRead0 + kReadNode2);
    EXPECT_EQ(kReadNode2Reply + kRead0Reply, master.receive(14));
    EXPECT_EQ("request 1\nlost 1\nrequest 2\nreply 2\nreply 1\n", told(simulator));
    exchange(master, kRead0, kRead0Reply);
}

TEST(SimulatorPacingTest, WhoHearsNothingAnswersNothingAndUsesNoFaultUp) {
    Simulator simulator({.nodes = {{.address = 1, .presence = kDead}, {.address = 2}}});
    simulator.faults().add({.exception = 4});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0);
    ASSERT_TRUE(simulator.waitForEvents(1, 10s));
    master.send(kReadNode2);
    EXPECT_EQ((Bytes{0x02, 0x83, 0x04, 0xB0, 0xF3}), master.receive(5));
    simulator.slave().setPresence(1, {});
    exchange(master, kRead0, kRead0Reply);
}

TEST(SimulatorPacingTest, WhoGoesAwayBeforeItsReplySaysNothingAndComesBack) {
    Slave* slave = nullptr;
    const auto pullThePlug = [&](const LineEvent& event) {
        if (event.raw == kReadNode2) slave->setPresence(1, kDead);
    };
    Simulator simulator({.nodes = {{.address = 1, .turnaround = {.least = 50ms}},
                                   {.address = 2, .turnaround = {.least = 100ms}}},
                         .trace = pullThePlug});
    slave = &simulator.slave();
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0 + kRead0 + kReadNode2);
    EXPECT_EQ(kReadNode2Reply, master.receive(7)) << "node 1 would have been first";
    simulator.slave().setPresence(1, {});
    exchange(master, kRead0, kRead0Reply);
}

TEST(SimulatorPacingTest, ASilenceEndsAFrameOnASlowLineToo) {
    Simulator simulator({.rate = kTenMilliseconds, .silenceMs = 5});
    simulator.start();
    TestMaster master(simulator.path());
    EXPECT_GE(exchange(master, kUnknown, {0x01, 0x87, 0x01, 0x82, 0x30}), 40ms + 5ms + 35ms + 50ms);
}

TEST(SimulatorPacingTest, StopWaitsNeitherForASlowReplyNorForASlowRequest) {
    for (const Bytes& request : {kRead0, kUnknown}) {
        Simulator simulator(
            {.nodes = {{.turnaround = {.least = 1h}}}, .rate = {.baud = 1, .characterBits = 10}});
        simulator.start();
        TestMaster master(simulator.path());
        master.send(request);
        simulator.stop();
        EXPECT_TRUE(master.seesHangUp());
    }
}

TEST(SimulatorPacingTest, AMasterThatWritesWithoutEndIsHeldBackAndNothingGrows) {
    Simulator simulator({.rate = {.baud = 1200, .characterBits = 10}});
    simulator.start();
    TestMaster master(simulator.path());
    EXPECT_LT(master.sendUntilFull(1000000), 100000U);
    simulator.stop();
}

TEST(SimulatorPacingTest, ImpossibleTimesAreRefused) {
    EXPECT_THROW(Simulator({.nodes = {{.turnaround = {.least = -1ns}}}}), std::invalid_argument);
    EXPECT_THROW(Simulator({.nodes = {{.presence = {.there = 1s, .away = -1s}}}}),
                 std::invalid_argument);
}

}  // namespace
}  // namespace sim
