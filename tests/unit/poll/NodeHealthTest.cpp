#include "poll/NodeHealth.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;

NodeHealth::TimePoint at(int ms) {
    return NodeHealth::TimePoint{milliseconds{ms}};
}

NodeHealth lostAt(int ms) {
    NodeHealth health{Patience{}};
    health.failed(at(ms));
    health.failed(at(ms));
    health.failed(at(ms));
    return health;
}

TEST(NodeHealthTest, TheThirdFailureInARowMakesItUnreachable) {
    NodeHealth health{Patience{}};
    EXPECT_FALSE(health.failed(at(0)));
    EXPECT_FALSE(health.failed(at(1)));
    EXPECT_TRUE(health.reachable());
    EXPECT_TRUE(health.failed(at(2)));
    EXPECT_FALSE(health.reachable());
}

TEST(NodeHealthTest, ASuccessBetweenFailuresStartsTheCountAnew) {
    NodeHealth health{Patience{}};
    health.failed(at(0));
    health.failed(at(1));
    EXPECT_FALSE(health.succeeded(at(2)));
    EXPECT_FALSE(health.failed(at(3)));
    EXPECT_FALSE(health.failed(at(4)));
    EXPECT_TRUE(health.reachable());
}

TEST(NodeHealthTest, PausesDoubleUpToTheLongest) {
    NodeHealth health = lostAt(0);
    std::vector<long> pauses;
    for (int probe = 0; probe < 7; ++probe) {
        const auto pause = health.probeAt() - (probe == 0 ? at(0) : at(probe * 1000));
        pauses.push_back(std::chrono::duration_cast<milliseconds>(pause).count());
        EXPECT_FALSE(health.failed(at((probe + 1) * 1000)));
    }
    EXPECT_EQ((std::vector<long>{500, 1000, 2000, 4000, 8000, 10000, 10000}), pauses);
}

TEST(NodeHealthTest, AnAnswerBringsItBackWithPausesAsAtFirst) {
    NodeHealth health = lostAt(0);
    health.failed(at(500));
    EXPECT_TRUE(health.succeeded(at(1500)));
    EXPECT_TRUE(health.reachable());
    EXPECT_FALSE(health.succeeded(at(1600)));
    for (int i = 0; i < 3; ++i)
        health.failed(at(2000));
    EXPECT_EQ(at(2500), health.probeAt());
}

TEST(NodeHealthTest, UnreachableTimesAddUp) {
    NodeHealth health = lostAt(0);
    EXPECT_EQ(seconds{3}, health.unreachableFor(at(3000)));
    health.succeeded(at(4000));
    EXPECT_EQ(seconds{4}, health.unreachableFor(at(9000)));
    for (int i = 0; i < 3; ++i)
        health.failed(at(10000));
    EXPECT_EQ(seconds{5}, health.unreachableFor(at(11000)));
}

}  // namespace
}  // namespace poll
