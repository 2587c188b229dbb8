// Nodes that are dead or come and go.
#include "sim/Presence.h"

#include <gtest/gtest.h>

#include <stdexcept>

#include "sim/Slave.h"

namespace sim {
namespace {

using wire::Bytes;
using namespace std::chrono_literals;

const Bytes kRead{3, 3, 0, 0, 0, 1};
const Bytes kReply{3, 3, 2, 0x0B, 0xB8};
const Bytes kBroadcast{0, 6, 0, 0, 0, 42};

TEST(PresenceTest, WithoutAnAbsenceItLastsForEver) {
    EXPECT_TRUE(Presence{}.at(0s));
    EXPECT_TRUE(Presence{}.at(1000h));
    EXPECT_TRUE((Presence{.there = 10s, .away = 0s}).at(15s));
}

TEST(PresenceTest, TheDeadNeverCome) {
    EXPECT_FALSE(kDead.at(0s));
    EXPECT_FALSE(kDead.at(1000h));
}

TEST(PresenceTest, ComesAndGoesBeginningWithItsPresence) {
    const Presence presence{.there = 10s, .away = 5s};
    for (const Nanos round : {0s, 15s, 15000s}) {
        EXPECT_TRUE(presence.at(round));
        EXPECT_TRUE(presence.at(round + 10s - 1ns));
        EXPECT_FALSE(presence.at(round + 10s));
        EXPECT_FALSE(presence.at(round + 15s - 1ns));
    }
}

TEST(PresenceTest, WhoIsAwayNeitherAnswersNorExecutesABroadcast) {
    Slave slave({{.address = 2}, {.address = 3, .presence = {.there = 1s, .away = 1s}}});
    EXPECT_EQ(kReply, slave.answer(kRead, 0s));
    EXPECT_FALSE(slave.answer(kRead, 1s));
    EXPECT_FALSE(slave.answer(kBroadcast, 1s));
    EXPECT_EQ(42U, slave.get(2, Area::HoldingRegister, 0));
    EXPECT_EQ(kReply, slave.answer(kRead, 2s)) << "its memory has stayed";
    EXPECT_TRUE(slave.isThere(3, 0s));
    EXPECT_FALSE(slave.isThere(3, 1s));
    EXPECT_FALSE(slave.isThere(4, 0s));
    EXPECT_TRUE(slave.hasNode(3));
}

TEST(PresenceTest, MayChangeWhileServing) {
    Slave slave({NodeOptions{.address = 3}});
    slave.setPresence(3, kDead);
    EXPECT_FALSE(slave.answer(kRead));
    slave.setPresence(3, {});
    EXPECT_EQ(kReply, slave.answer(kRead));
    EXPECT_THROW(slave.setPresence(4, kDead), std::out_of_range);
}

}  // namespace
}  // namespace sim
