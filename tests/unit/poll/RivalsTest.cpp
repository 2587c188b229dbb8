#include "poll/Rivals.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;

TagPlace words(long first, long items, milliseconds period = milliseconds{1000}) {
    return {.node = 1, .area = "HREG", .first = first, .items = items, .period = period};
}

CostModel line() {
    CostModel costs;
    costs.rate = {19200, 10};
    return costs;
}

std::vector<std::vector<std::size_t>> tagsOf(const Plan& plan) {
    std::vector<std::vector<std::size_t>> tags;
    for (const Block& block : plan.blocks)
        tags.push_back(block.tags);
    return tags;
}

using Blocks = std::vector<std::vector<std::size_t>>;

TEST(RivalsTest, SinglesAreOneBlockForEachTag) {
    const std::vector<TagPlace> places{words(1, 1), words(0, 2), words(0, 300)};
    const Plan plan = planOfSingles(places, {}, line());
    EXPECT_EQ((Blocks{{0}, {1}, {2}}), tagsOf(plan));
    const PlanSums sums = sumsOf(plan, {}, line());
    EXPECT_EQ(3U, sums.blocks);
    EXPECT_EQ(1 + 1 + 3, sums.requests);
    EXPECT_EQ((8U + 7) + (8 + 9) + 2 * (8 + 255) + (8 + 105), sums.characters);
}

TEST(RivalsTest, AFixedGapJoinsWhatLiesNoFurtherApart) {
    const std::vector<TagPlace> places{words(9, 1), words(0, 1), words(20, 1)};
    EXPECT_EQ((Blocks{{1}, {0}, {2}}), tagsOf(planOfFixedGap(places, 7, {}, line())));
    EXPECT_EQ((Blocks{{1, 0}, {2}}), tagsOf(planOfFixedGap(places, 8, {}, line())));
    EXPECT_EQ((Blocks{{1, 0, 2}}), tagsOf(planOfFixedGap(places, 50, {}, line())));
}

TEST(RivalsTest, AFixedGapKeepsToTheLimitOfARequestAndToPeriods) {
    EXPECT_EQ((Blocks{{0}, {1}}),
              tagsOf(planOfFixedGap(std::vector{words(0, 100), words(100, 26)}, 50, {}, line())));
    EXPECT_EQ((Blocks{{1}, {0}}),
              tagsOf(planOfFixedGap(std::vector{words(0, 1), words(1, 1, milliseconds{100})}, 50,
                                    {}, line())));
}

TEST(RivalsTest, NoRivalTakesLessThanThePlan) {
    std::vector<TagPlace> places;
    for (long first = 0; first < 4000; first += 1 + first * 7 % 31)
        places.push_back(words(first, 1 + first % 4));
    const double least = makePlan(places, {}, line()).load;
    EXPECT_LT(least, planOfSingles(places, {}, line()).load);
    for (long gap = 0; gap < 60; ++gap)
        EXPECT_LE(least, planOfFixedGap(places, gap, {}, line()).load * (1 + 1e-9)) << gap;
}

}  // namespace
}  // namespace poll
