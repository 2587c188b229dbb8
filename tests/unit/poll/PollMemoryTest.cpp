// What a line that is polled for ever takes from the heap.
#include <gtest/gtest.h>

#include "poll/LineMachine.h"
#include "tests/support/AllocationCounter.h"
#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

TEST(PollMemoryTest, AHundredThousandCyclesDoNotGrow) {
    SetupBuilder builder;
    builder.block(1, 0, 8, milliseconds{100}).block(2, 0, 8, milliseconds{100});
    builder.block(3, 0, 8, milliseconds{100});
    FakeLine line(builder);
    line.devices.isRecording = false;
    line.devices.dead = {2};
    line.devices.refused = {5};
    line.run(seconds{130});  // everything has happened once: splits, probes, trials
    const std::uint64_t before = line.machine.snapshot().line.cycles;

    const testing_support::AllocationCounter counter;
    line.run(seconds{10'300});  // a cycle that waits for a probe takes up to four periods
    const std::size_t allocations = counter.allocations();
    const std::size_t releases = counter.releases();
    EXPECT_GT(allocations, 0U);
    EXPECT_EQ(allocations, releases);
    EXPECT_GE(line.machine.snapshot().line.cycles - before, 100'000U);
}

}  // namespace
}  // namespace poll
