// One dead slave among eight: what it costs the others, in simulated time.
#include <gtest/gtest.h>

#include "poll/LineMachine.h"
#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

/// Eight nodes of four blocks each.
SetupBuilder eightNodes(milliseconds period) {
    SetupBuilder builder;
    for (int node = 1; node <= 8; ++node)
        for (long block = 0; block < 4; ++block)
            builder.block(node, block * 100, 10, period);
    return builder;
}

/// @return the reads that the seven others had answered in a minute.
double readsOfOthers(milliseconds period, const std::set<int>& dead) {
    FakeLine line(eightNodes(period));
    line.devices.dead = dead;
    line.run(std::chrono::minutes{1});
    double reads = 0;
    for (const NodeState& node : line.machine.snapshot().nodes)
        if (node.node != 8) reads += static_cast<double>(node.replies);
    return reads;
}

TEST(DeadNodeTest, TheOthersCycleGrowsByLessThanATwentiethAtFullSpeed) {
    const double cycleGrowth =
        readsOfOthers(milliseconds{1}, {}) / readsOfOthers(milliseconds{1}, {8});
    EXPECT_LT(cycleGrowth, 1.05);
}

TEST(DeadNodeTest, TheOthersCycleGrowsByLessThanATwentiethOnALineWithTimeToSpare) {
    const double cycleGrowth =
        readsOfOthers(milliseconds{500}, {}) / readsOfOthers(milliseconds{500}, {8});
    EXPECT_LT(cycleGrowth, 1.05);
}

TEST(DeadNodeTest, TheOthersKeepTheirPeriod) {
    FakeLine line(eightNodes(milliseconds{1000}));
    line.devices.dead = {8};
    line.run(std::chrono::minutes{1});
    EXPECT_EQ(60U, line.tag(0).count);
    EXPECT_EQ(Quality::Never, line.tag(319).quality);
    EXPECT_EQ(0U, line.machine.snapshot().line.lateCycles);
    EXPECT_LT(line.devices.timeout * line.node(7).timeouts, seconds{4});
}

}  // namespace
}  // namespace poll
