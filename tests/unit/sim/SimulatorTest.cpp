// The whole simulator on its pseudo terminal. Frames are written out with their checks.
#include "sim/Simulator.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <future>
#include <stdexcept>
#include <system_error>

#include "TestMaster.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::Mode;

using namespace std::chrono_literals;
using Kind = LineEvent::Kind;

const Bytes kRead0{0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0A};
const Bytes kRead0Reply{0x01, 0x03, 0x02, 0x03, 0xE8, 0xB8, 0xFA};
const Bytes kRead0Damaged{0x01, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x0B};
const Bytes kReadNode2{0x02, 0x03, 0x00, 0x00, 0x00, 0x01, 0x84, 0x39};
const Bytes kReadNode2Reply{0x02, 0x03, 0x02, 0x07, 0xD0, 0xFF, 0xE8};

std::vector<Kind> kindsOf(const std::vector<LineEvent>& events) {
    std::vector<Kind> kinds;
    kinds.reserve(events.size());
    for (const LineEvent& event : events)
        kinds.push_back(event.kind);
    return kinds;
}

TEST(SimulatorTest, AnswersRtu) {
    Simulator simulator({});
    simulator.start();
    TestMaster master(simulator.path());
    ASSERT_TRUE(master.isOpen());
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
}

TEST(SimulatorTest, AnswersAscii) {
    Simulator simulator({.mode = Mode::Ascii});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(":010300000001FB\r\n");
    EXPECT_EQ(":01030203E80F\r\n", master.receiveText(15));
}

TEST(SimulatorTest, AnnouncedLengthNeedsNoSilence) {
    // With a silence of an hour only the announced length can end the frame.
    Simulator simulator({.silenceMs = 3600000});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
}

TEST(SimulatorTest, UnknownFunctionIsRefusedAfterTheSilence) {
    Simulator simulator({});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(Bytes{0x01, 0x07, 0x41, 0xE2});
    EXPECT_EQ((Bytes{0x01, 0x87, 0x01, 0x82, 0x30}), master.receive(5));
}

TEST(SimulatorTest, DamagedRequestStaysUnanswered) {
    Simulator simulator({});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0Damaged);
    ASSERT_TRUE(simulator.waitForEvents(1, 10s));
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
    const auto events = simulator.log();
    EXPECT_EQ((std::vector{Kind::Damaged, Kind::Request, Kind::Reply}), kindsOf(events));
    EXPECT_EQ(kRead0Damaged, events[0].raw);
    EXPECT_EQ(kRead0, events[1].raw);
    EXPECT_EQ(kRead0Reply, events[2].raw);
}

TEST(SimulatorTest, BroadcastIsExecutedAndStaysUnanswered) {
    Simulator simulator({.nodes = {{.address = 1}, {.address = 2}}});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(Bytes{0x00, 0x06, 0x00, 0x07, 0x00, 0x2A, 0xB8, 0x05});
    master.send(Bytes{0x01, 0x03, 0x00, 0x07, 0x00, 0x01, 0x35, 0xCB});
    EXPECT_EQ((Bytes{0x01, 0x03, 0x02, 0x00, 0x2A, 0x39, 0x9B}), master.receive(7));
    EXPECT_EQ(42U, simulator.slave().get(2, Area::HoldingRegister, 7));
}

TEST(SimulatorTest, SeveralNodesShareTheLineAndOthersStayQuiet) {
    Simulator simulator({.nodes = {{.address = 2}}});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0);
    master.send(kReadNode2);
    EXPECT_EQ(kReadNode2Reply, master.receive(kReadNode2Reply.size()));
}

TEST(SimulatorTest, LongRegisterIsWrittenAtOnce) {
    Simulator simulator({.nodes = {{.address = 1, .longs = LongRange{}}}, .silenceMs = 3600000});
    simulator.start();
    TestMaster master(simulator.path());
    const Bytes request{0x01, 0x06, 0x13, 0x88, 0xDE, 0xAD, 0xBE, 0xEF, 0x9E, 0x9E};
    master.send(request);
    EXPECT_EQ(request, master.receive(request.size()));
    EXPECT_EQ(0xDEADBEEFU, simulator.slave().get(1, Area::LongRegister, 5000));
}

TEST(SimulatorTest, MastersComeAndGo) {
    Simulator simulator({});
    simulator.start();
    for (int round = 0; round < 5; ++round) {
        TestMaster master(simulator.path());
        master.send(kRead0);
        EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size())) << "round " << round;
    }
}

TEST(SimulatorTest, MemoryMayChangeWhileServing) {
    Simulator simulator({});
    simulator.start();
    simulator.slave().set(1, Area::HoldingRegister, 0, 1005);
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ((Bytes{0x01, 0x03, 0x02, 0x03, 0xED, 0x78, 0xF9}), master.receive(7));
}

TEST(SimulatorTest, TraceSeesTheEventsOfTheLog) {
    std::vector<std::string> lines;
    Simulator simulator(
        {.trace = [&](const LineEvent& event) { lines.push_back(describe(event, Mode::Rtu)); }});
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
    simulator.stop();
    EXPECT_EQ(
        (std::vector<std::string>{"request 01 03 00 00 00 01 84 0A", "reply 01 03 02 03 E8 B8 FA"}),
        lines);
}

TEST(SimulatorTest, LogKeepsTheLatestEvents) {
    Simulator simulator({.logLimit = 3});
    simulator.start();
    TestMaster master(simulator.path());
    for (int i = 0; i < 4; ++i) {
        master.send(kRead0);
        master.receive(kRead0Reply.size());
    }
    EXPECT_EQ((std::vector{Kind::Reply, Kind::Request, Kind::Reply}), kindsOf(simulator.log()));
    simulator.clearLog();
    EXPECT_TRUE(simulator.log().empty());
    EXPECT_FALSE(simulator.waitForEvents(1, 0ms));
}

TEST(SimulatorTest, StopTakesThePortAwayAndStartBringsItBackWithItsMemory) {
    Simulator simulator({});
    simulator.start();
    TestMaster before(simulator.path());
    simulator.slave().set(1, Area::HoldingRegister, 0, 1005);
    simulator.stop();
    EXPECT_TRUE(before.seesHangUp());
    simulator.stop();
    simulator.start();
    TestMaster after(simulator.path());
    after.send(kRead0);
    EXPECT_EQ((Bytes{0x01, 0x03, 0x02, 0x03, 0xED, 0x78, 0xF9}), after.receive(7));
}

TEST(SimulatorTest, StartWhileServingKeepsTheLine) {
    Simulator simulator({});
    EXPECT_EQ("", simulator.path());
    simulator.start();
    const std::string path = simulator.path();
    simulator.start();
    EXPECT_EQ(path, simulator.path());
}

TEST(SimulatorTest, WaitReturnsWhenTheStopIsRequested) {
    Simulator simulator({});
    simulator.start();
    // Held open: once both ends are closed, the device's number is free for the next comer.
    TestMaster master(simulator.path());
    auto end = std::async(std::launch::async, [&] { return simulator.wait(); });
    simulator.requestStop();
    EXPECT_EQ(Simulator::End::Stopped, end.get());
    EXPECT_TRUE(master.seesHangUp());
    EXPECT_FALSE(std::filesystem::exists(simulator.device()));
}

TEST(SimulatorTest, AStopRequestedBeforeTheStartIsNotLost) {
    Simulator simulator({});
    simulator.requestStop();
    simulator.start();
    EXPECT_EQ(Simulator::End::Stopped, simulator.wait());
    simulator.start();
    TestMaster master(simulator.path());
    master.send(kRead0);
    EXPECT_EQ(kRead0Reply, master.receive(kRead0Reply.size()));
}

TEST(SimulatorTest, LinkStaysTheSameOverStarts) {
    std::string room = testing::TempDir() + "simulator-XXXXXX";
    ASSERT_NE(::mkdtemp(room.data()), nullptr);
    const std::string link = room + "/port";
    {
        Simulator simulator({.link = link});
        for (int round = 0; round < 2; ++round) {
            simulator.start();
            EXPECT_EQ(link, simulator.path());
            EXPECT_EQ(simulator.device(), std::filesystem::read_symlink(link));
            simulator.stop();
        }
    }
    EXPECT_FALSE(std::filesystem::is_symlink(link));
    std::filesystem::remove_all(room);
}

TEST(SimulatorTest, ALinkThatCannotBeMadeIsReported) {
    Simulator simulator({.link = "/nowhere/at/all"});
    EXPECT_THROW(simulator.start(), std::system_error);
    simulator.stop();
}

TEST(SimulatorTest, ImpossibleOptionsAreRefused) {
    EXPECT_THROW(Simulator({.silenceMs = 0}), std::invalid_argument);
    EXPECT_THROW(Simulator({.nodes = {{.address = 0}}}), std::invalid_argument);
}

}  // namespace
}  // namespace sim
