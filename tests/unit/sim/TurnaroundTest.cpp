#include "sim/Turnaround.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace sim {
namespace {

using namespace std::chrono_literals;

std::vector<Nanos> taken(const Turnaround& turnaround, std::size_t count, std::uint64_t seed = 1) {
    Turnarounds turnarounds(turnaround, seed);
    std::vector<Nanos> all(count);
    std::generate(all.begin(), all.end(), [&] { return turnarounds.next(); });
    return all;
}

TEST(TurnaroundTest, IsNothingAtFirst) {
    EXPECT_EQ((std::vector<Nanos>{0ns, 0ns}), taken({}, 2));
}

TEST(TurnaroundTest, StaysFixedWithoutAnEndAboveItsBegin) {
    const std::vector<Nanos> fixed(3, 20ms);
    EXPECT_EQ(fixed, taken({.least = 20ms}, 3));
    EXPECT_EQ(fixed, taken({.least = 20ms, .most = 20ms}, 3));
    EXPECT_EQ(fixed, taken({.least = 20ms, .most = 10ms}, 3));
}

TEST(TurnaroundTest, JittersOverItsWholeRangeAndNoFurther) {
    const auto all = taken({.least = 20ns, .most = 23ns}, 200);
    for (const Nanos each : {20ns, 21ns, 22ns, 23ns})
        EXPECT_NE(0, std::count(all.begin(), all.end(), each)) << each.count();
    EXPECT_EQ(20ns, *std::min_element(all.begin(), all.end()));
    EXPECT_EQ(23ns, *std::max_element(all.begin(), all.end()));
}

TEST(TurnaroundTest, JittersBySeed) {
    const Turnaround jitter{.least = 20ms, .most = 60ms};
    EXPECT_EQ(taken(jitter, 100, 7), taken(jitter, 100, 7));
    EXPECT_NE(taken(jitter, 100, 7), taken(jitter, 100, 8));
}

TEST(TurnaroundTest, GrowsWithEveryReplyUpToItsEnd) {
    EXPECT_EQ((std::vector<Nanos>{20ms, 25ms, 30ms, 32ms, 32ms}),
              taken({.least = 20ms, .most = 32ms, .growth = 5ms}, 5));
}

}  // namespace
}  // namespace sim
