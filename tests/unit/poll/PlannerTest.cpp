// What must not get lost, be torn or be mixed in a plan.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "poll/Plan.h"

namespace poll {
namespace {

using std::chrono::milliseconds;
using std::chrono::nanoseconds;
using Indices = std::vector<std::size_t>;

TagPlace words(long first, long items, milliseconds period = milliseconds{1000}) {
    return {.node = 1, .area = "HREG", .first = first, .items = items, .period = period};
}

TagPlace coils(long first, long items) {
    return {
        .node = 1, .area = "OUTP", .bits = true, .first = first, .items = items, .itemBytes = 0};
}

CostModel line() {
    CostModel costs;
    costs.rate = {19200, 10};
    return costs;
}

Plan planOf(const std::vector<TagPlace>& places, const Limits& limits = {},
            const CostModel& costs = line()) {
    return makePlan(places, limits, costs);
}

std::vector<Indices> tagsOf(const Plan& plan) {
    std::vector<Indices> tags;
    for (const Block& block : plan.blocks)
        tags.push_back(block.tags);
    return tags;
}

using Blocks = std::vector<Indices>;

TEST(PlannerTest, NoTagsMakeAnEmptyPlan) {
    const Plan plan = planOf({});
    EXPECT_TRUE(plan.blocks.empty());
    EXPECT_EQ(0, plan.load);
}

TEST(PlannerTest, NeighboursShareARead) {
    const Plan plan = planOf({words(9, 1), words(10, 2), words(12, 4)});
    ASSERT_EQ(1U, plan.blocks.size());
    EXPECT_EQ(9, plan.blocks[0].first);
    EXPECT_EQ(7, plan.blocks[0].items);
    EXPECT_EQ(0, plan.blocks[0].fillerItems);
    EXPECT_EQ(1, plan.blocks[0].requests);
    EXPECT_EQ(line().readCost(1, 2).of(7), plan.blocks[0].cost);
}

TEST(PlannerTest, UnsortedTagsAreReadInTheOrderOfTheirItems) {
    const Plan plan = planOf({words(12, 1), words(9, 1), words(11, 1), words(10, 1)});
    EXPECT_EQ((Blocks{{1, 3, 2, 0}}), tagsOf(plan));
}

TEST(PlannerTest, AHoleIsReadWhereItIsCheaperThanARequest) {
    // A request: 8 + 5 characters and twice 3.5 of silence, as much as 10 registers.
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(planOf({words(0, 1), words(10, 1)})));
    EXPECT_EQ(9, planOf({words(0, 1), words(10, 1)}).blocks[0].fillerItems);
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(planOf({words(0, 1), words(12, 1)})));
}

TEST(PlannerTest, ASlowNodeIsWorthReadingLongerHoles) {
    CostModel costs = line();
    costs.turnarounds[1] = milliseconds{100};
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(planOf({words(0, 1), words(100, 1)}, {}, costs)));
}

TEST(PlannerTest, TheGapThatEndsAReplyIsWorthReadingLongerHoles) {
    CostModel costs = line();
    costs.gapAfterReply = milliseconds{7};
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(planOf({words(0, 1), words(13, 1)}, {}, costs)));
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(planOf({words(0, 1), words(13, 1)})));
}

TEST(PlannerTest, OverlappingTagsAreReadOnce) {
    const Plan plan = planOf({words(10, 4), words(12, 4)});
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(plan));
    EXPECT_EQ(6, plan.blocks[0].items);
}

TEST(PlannerTest, NestedTagsAreReadOnce) {
    const Plan plan = planOf({words(10, 8), words(12, 2), words(10, 1), words(17, 1)});
    EXPECT_EQ((Blocks{{0, 2, 1, 3}}), tagsOf(plan));
    EXPECT_EQ(8, plan.blocks[0].items);
}

TEST(PlannerTest, ATagBehindANestedOneIsNotLost) {
    // The end of a read is that of its longest tag, not of its last.
    const Plan plan = planOf({words(0, 100), words(2, 1), words(99, 10)});
    EXPECT_EQ((Blocks{{0, 1, 2}}), tagsOf(plan));
    EXPECT_EQ(109, plan.blocks[0].items);
}

TEST(PlannerTest, DuplicateTagsAreAllServed) {
    const Plan plan = planOf({words(10, 2), words(10, 2), words(10, 2)});
    EXPECT_EQ((Blocks{{0, 1, 2}}), tagsOf(plan));
    EXPECT_EQ(2, plan.blocks[0].items);
}

TEST(PlannerTest, TagsAtOneAddressWithDifferentTypesAreBothServed) {
    // A short, a float and an array that begin at one register.
    const Plan plan = planOf({words(10, 1), words(10, 2), words(10, 20)});
    EXPECT_EQ((Blocks{{2, 1, 0}}), tagsOf(plan));
    EXPECT_EQ(20, plan.blocks[0].items);
}

TEST(PlannerTest, ABooleanTagOfARegisterStandsBesideRegisterTags) {
    // As a place it is its register, several bits of one register are the same place.
    const Plan plan = planOf({words(10, 1), words(10, 1), words(11, 2)});
    EXPECT_EQ((Blocks{{0, 1, 2}}), tagsOf(plan));
}

TEST(PlannerTest, BitAndRegisterAreasNeverMix) {
    TagPlace sameName = coils(0, 1);
    sameName.area = "HREG";
    const Plan plan = planOf({words(0, 1), coils(0, 1), words(1, 1), coils(1, 1), sameName});
    EXPECT_EQ((Blocks{{0, 2}, {4}, {1, 3}}), tagsOf(plan));
}

TEST(PlannerTest, NodesAreasAndItemSizesNeverMix) {
    TagPlace otherNode = words(1, 1);
    otherNode.node = 2;
    TagPlace otherArea = words(1, 1);
    otherArea.area = "IREG";
    TagPlace otherSize = words(1, 1);
    otherSize.itemBytes = 4;
    const Plan plan = planOf({words(0, 1), otherNode, otherArea, otherSize});
    EXPECT_EQ(4U, plan.blocks.size());
}

TEST(PlannerTest, BitsCostTheirBytes) {
    const Plan plan = planOf({coils(0, 1), coils(150, 3)});
    ASSERT_EQ(1U, plan.blocks.size());
    EXPECT_EQ(153, plan.blocks[0].items);
    EXPECT_EQ(149, plan.blocks[0].fillerItems);
    EXPECT_EQ(line().readCost(1, 0).of(153), plan.blocks[0].cost);
}

TEST(PlannerTest, ATagThatARequestCanCarryIsNeverTorn) {
    std::vector<TagPlace> places;
    for (long first = 0; first < 1000; first += 50)
        places.push_back(words(first, 50));
    for (const Block& block : planOf(places).blocks) {
        EXPECT_GE(125, block.items);
        EXPECT_EQ(0, block.first % 50);
        EXPECT_EQ(0, block.items % 50);
    }
}

TEST(PlannerTest, ATagAsWideAsARequestFits) {
    const Plan plan = planOf({words(0, 125), words(125, 1)});
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(plan));
    EXPECT_EQ(1, plan.blocks[0].requests);
}

TEST(PlannerTest, ATagWiderThanARequestIsAReadOfItsOwn) {
    const Plan plan = planOf({words(0, 300), words(300, 1), words(400, 1)});
    EXPECT_EQ((Blocks{{0}, {1}, {2}}), tagsOf(plan));
    EXPECT_EQ(3, plan.blocks[0].requests);
    const ReadCost cost = line().readCost(1, 2);
    EXPECT_EQ(cost.of(125) + cost.of(125) + cost.of(50), plan.blocks[0].cost);
}

TEST(PlannerTest, WhatAWideTagBringsIsNotReadAgain) {
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(planOf({words(0, 300), words(130, 4)})));
    EXPECT_EQ((Blocks{{0, 1, 2}}), tagsOf(planOf({words(0, 300), words(0, 300), words(9, 150)})));
}

TEST(PlannerTest, ATagOnTheCutOfAWideOneIsReadByItself) {
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(planOf({words(0, 300), words(124, 2)})));
}

TEST(PlannerTest, TheConfiguredLimitOfARequestCounts) {
    Limits limits;
    limits.set(1, "HREG", {.mostItems = 4});
    const Plan plan = planOf({words(0, 2), words(2, 2), words(5, 2), words(7, 5)}, limits);
    EXPECT_EQ((Blocks{{0, 1}, {2}, {3}}), tagsOf(plan));
    EXPECT_EQ(2, plan.blocks[2].requests);
}

TEST(PlannerTest, AReadNeverLeavesTheArea) {
    Limits limits;
    limits.set(1, "HREG", {.mostItems = 125, .firstItem = 0, .endItem = 65536});
    const Plan plan = planOf({words(65535, 1), words(65530, 2)}, limits);
    ASSERT_EQ(1U, plan.blocks.size());
    EXPECT_EQ(65536, plan.blocks[0].first + plan.blocks[0].items);
}

TEST(PlannerTest, ATagBeyondTheAreaDoesNotSpoilOthers) {
    Limits limits;
    limits.set(1, "HREG", {.mostItems = 125, .firstItem = 0, .endItem = 65536});
    const Plan plan = planOf({words(65534, 1), words(65535, 2), words(65535, 1)}, limits);
    EXPECT_EQ((Blocks{{0, 2}, {1}}), tagsOf(plan));
}

TEST(PlannerTest, ATagWithoutItemsIsNotLost) {
    EXPECT_EQ((Blocks{{1}, {0}}), tagsOf(planOf({words(5, 0), words(5, 1)})));
}

TEST(PlannerTest, TheDriversOwnAreasCostNothing) {
    Limits limits;
    limits.set(0, "SP_Baud", {.mostItems = 1, .onLine = false});
    TagPlace own{.node = 0, .area = "SP_Baud", .first = 0, .items = 1, .itemBytes = 4};
    const Plan plan = planOf({own, own}, limits);
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(plan));
    EXPECT_EQ(0, plan.blocks[0].requests);
    EXPECT_EQ(nanoseconds{0}, plan.blocks[0].cost);
    EXPECT_EQ(0, plan.load);
}

TEST(PlannerTest, AReadIsAsFrequentAsItsMostFrequentTag) {
    const Plan plan = planOf({words(0, 1, milliseconds{1000}), words(0, 1, milliseconds{100})});
    ASSERT_EQ(1U, plan.blocks.size());
    EXPECT_EQ(milliseconds{100}, plan.blocks[0].period);
}

TEST(PlannerTest, ASlowTagJoinsAFastOneWhereThatCostsLessThanTwoReads) {
    const Plan plan = planOf({words(0, 1, milliseconds{500}), words(1, 1, milliseconds{1000})});
    EXPECT_EQ((Blocks{{0, 1}}), tagsOf(plan));
}

TEST(PlannerTest, ASlowTagStaysAwayFromAFastOneWhereThatCostsMore) {
    const Plan plan = planOf({words(0, 1, milliseconds{100}), words(1, 50, milliseconds{10000})});
    EXPECT_EQ((Blocks{{0}, {1}}), tagsOf(plan));
    const ReadCost cost = line().readCost(1, 2);
    const auto seconds = [&](long items) {
        return std::chrono::duration<double>(cost.of(items)).count();
    };
    EXPECT_NEAR(seconds(1) / 0.1 + seconds(50) / 10, plan.load, 1e-9);
}

TEST(PlannerTest, ASlowTagInsideAFastReadCostsNothing) {
    const std::vector<TagPlace> fast{words(0, 1, milliseconds{100}),
                                     words(8, 1, milliseconds{100})};
    std::vector<TagPlace> both = fast;
    both.push_back(words(4, 1, milliseconds{60000}));
    EXPECT_EQ(planOf(fast).load, planOf(both).load);
}

TEST(PlannerTest, EveryBlockSaysWhy) {
    Limits limits;
    limits.set(1, "HREG", {.mostItems = 125, .endItem = 1000});
    const Plan plan = planOf(
        {words(0, 1), words(4, 1), words(60, 100), words(161, 30), words(300, 200), words(999, 5)},
        limits);
    ASSERT_EQ(5U, plan.blocks.size());
    EXPECT_EQ("2 tags, 3 filler items between them: saves 7.3 ms", plan.blocks[0].reason);
    EXPECT_EQ("one tag; 160 items with those in front, a request carries 125",
              plan.blocks[1].reason);
    EXPECT_EQ("one tag; 131 items with those in front, a request carries 125",
              plan.blocks[2].reason);
    EXPECT_EQ("wider than a request: cut into 2", plan.blocks[3].reason);
    EXPECT_EQ("reaches beyond the area: the driver refuses it", plan.blocks[4].reason);
}

TEST(PlannerTest, AHoleThatIsTooDearIsTheReason) {
    const Plan plan = planOf({words(0, 1), words(41, 1)});
    EXPECT_EQ("one tag; a hole of 40 items in front: together costs 31.3 ms more",
              plan.blocks[1].reason);
}

TEST(PlannerTest, AHundredThousandTagsAreAllServed) {
    std::mt19937 random(7);
    std::vector<TagPlace> places;
    for (int at = 0; at < 100'000; ++at) {
        TagPlace place = at % 2 == 0 ? words(0, 1) : coils(0, 1);
        place.node = 1 + static_cast<int>(random() % 8);
        place.first = static_cast<long>(random() % 65000);
        place.items = 1 + static_cast<long>(random() % 4);
        places.push_back(place);
    }
    std::vector<bool> seen(places.size());
    for (const Block& block : planOf(places).blocks)
        for (const std::size_t tag : block.tags)
            seen[tag] = true;
    EXPECT_EQ(seen.end(), std::find(seen.begin(), seen.end(), false));
}

}  // namespace
}  // namespace poll
