#include "cli/SimBehaviour.h"

#include <gtest/gtest.h>

#include "cli/ExitCode.h"
#include "cli/SimNodes.h"

namespace {

using namespace std::chrono_literals;

sim::SimulatorOptions lineOf(const cli::SimBehaviour& behaviour) {
    sim::SimulatorOptions line;
    line.nodes = cli::defaultSimNodes(false);
    cli::applySimBehaviour(behaviour, line);
    return line;
}

TEST(SimBehaviourTest, WithoutOptionsEverythingHappensAtOnce) {
    const sim::SimulatorOptions line = lineOf({});
    EXPECT_EQ(0, line.rate.baud);
    EXPECT_FALSE(line.losesWhileBusy);
    for (const sim::NodeOptions& node : line.nodes) {
        EXPECT_EQ(sim::Turnaround{}, node.turnaround);
        EXPECT_EQ(sim::Presence{}, node.presence);
        EXPECT_TRUE(node.refused.empty());
    }
}

TEST(SimBehaviourTest, BitsOfACharacterAreStartDataParityAndStop) {
    EXPECT_EQ(10, lineOf({.baud = 9600}).rate.characterBits);
    EXPECT_EQ(10, lineOf({.baud = 9600, .parity = "none"}).rate.characterBits);
    EXPECT_EQ(11, lineOf({.baud = 9600, .parity = "even"}).rate.characterBits);
    EXPECT_EQ(12, lineOf({.baud = 9600, .parity = "mark", .stopBits = "2"}).rate.characterBits);
    EXPECT_EQ(10, lineOf({.baud = 9600, .parity = "odd", .bits = "7"}).rate.characterBits);
    EXPECT_EQ(9600, lineOf({.baud = 9600}).rate.baud);
}

TEST(SimBehaviourTest, QueueAndSeedAreTheLines) {
    const sim::SimulatorOptions line = lineOf({.noQueue = true, .seed = 7});
    EXPECT_TRUE(line.losesWhileBusy);
    EXPECT_EQ(7U, line.seed);
}

TEST(SimBehaviourTest, OneNodesTextCountsMoreThanAllNodesInAnyOrder) {
    const auto line = lineOf({.turnarounds = {"3:50", "20"}, .away = {"2:1/2", "3/4"}});
    EXPECT_EQ(20ms, line.nodes[0].turnaround.least);
    EXPECT_EQ(50ms, line.nodes[2].turnaround.least);
    EXPECT_EQ((sim::Presence{.there = 3s, .away = 4s}), line.nodes[0].presence);
    EXPECT_EQ((sim::Presence{.there = 1s, .away = 2s}), line.nodes[1].presence);
}

TEST(SimBehaviourTest, TheDeadAreDeadWhateverIsSaidOfAbsences) {
    const auto line = lineOf({.dead = {2}, .away = {"2:1/0", "1/0"}});
    EXPECT_EQ(sim::kDead, line.nodes[1].presence);
    EXPECT_NE(sim::kDead, line.nodes[0].presence);
}

TEST(SimBehaviourTest, RefusedRangesAddUp) {
    const auto line = lineOf({.refused = {"1:OUTP:0-7", "HREG:5"}});
    EXPECT_EQ(2U, line.nodes[0].refused.size());
    EXPECT_EQ(1U, line.nodes[1].refused.size());
}

TEST(SimBehaviourTest, ComplaintsNameTheOptionAndItsText) {
    const struct {
        cli::SimBehaviour behaviour;
        std::string begin;
    } rows[] = {
        {{.turnarounds = {"fast"}}, "--turnaround fast: not MS, LEAST..MOST, "},
        {{.turnarounds = {"11:20"}}, "--turnaround 11:20: node 11 is not on the line"},
        {{.dead = {11}}, "--dead 11: the node is not on the line"},
        {{.away = {"5"}}, "--away 5: not THERE/AWAY "},
        {{.refused = {"HREG"}}, "--refuse HREG: not AREA:FIRST[-LAST] "},
        {{.stopBits = "2"}, "--parity, --stopbits and --bits say how long a character takes at "},
    };
    for (const auto& row : rows) {
        try {
            lineOf(row.behaviour);
            ADD_FAILURE() << "accepted: " << row.begin;
        } catch (const cli::CommandError& error) {
            EXPECT_TRUE(std::string(error.what()).starts_with(row.begin)) << error.what();
        }
    }
}

}  // namespace
