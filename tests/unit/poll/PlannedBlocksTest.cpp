// The planner's blocks on the loaded driver: they are what the engine's answers allow, each takes
// the requests that were planned, and every tag gets the value that it has when it is read alone.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

#include "poll/BlockReader.h"
#include "poll/Plan.h"
#include "tests/unit/poll/AnswersHost.h"
#include "tests/unit/poll/LoadedDriver.h"
#include "tests/unit/poll/PlaceByHand.h"
#include "tests/unit/poll/RandomTags.h"

namespace {

using namespace poll_test;

constexpr int kLists = 10000;
constexpr int kMostTags = 30;

/// What the configuration of LoadedDriver makes of the standard's limits.
poll::Limits limitsOfNodes() {
    poll::Limits limits;
    for (int node = 1; node <= 3; ++node) {
        for (const char* area : {"OUTP", "INP"})
            limits.set(node, area, {.mostItems = node == 2 ? 37 : 2000, .endItem = 65536});
        for (const char* area : {"HREG", "IREG"})
            limits.set(node, area, {.mostItems = node == 2 ? 11 : 125, .endItem = 65536});
        limits.set(node, "LONG", {.mostItems = 62, .endItem = 65536});
    }
    return limits;
}

class PlannedBlocksTest : public testing::Test {
  protected:
    void plan(const std::vector<std::string>& uris) {
        tags_ = driver_.tags(uris);
        places_.clear();
        for (const ITag* tag : tags_)
            places_.push_back(placeOf(engine_, *tag));
        plan_ = poll::makePlan(places_, limitsOfNodes(), costs_);
    }
    void freeTags() {
        for (const ITag* tag : tags_)
            driver_.channel().freeTag(const_cast<ITag*>(tag));
    }

    void expectEveryTagOnce() const {
        std::multiset<std::size_t> seen;
        for (const poll::Block& block : plan_.blocks)
            seen.insert(block.tags.begin(), block.tags.end());
        ASSERT_EQ(tags_.size(), seen.size());
        EXPECT_EQ(tags_.size(), std::set<std::size_t>(seen.begin(), seen.end()).size());
    }

    /// What shares a block may share it, and nothing begins in front of its first tag.
    void expectAllowed(const poll::Block& block) {
        const ITag* first = tags_[block.tags.front()];
        for (const std::size_t index : block.tags) {
            if (block.tags.size() == 1) continue;
            EXPECT_TRUE(engine_.CanBeOptimized(first, tags_[index], false))
                << first->GetVarName() << ' ' << tags_[index]->GetVarName();
            EXPECT_LE(places_[block.tags.front()].first, places_[index].first);
            EXPECT_LE(block.fillerItems * block.itemBytes, engine_.MaxUnusedGap(first));
        }
    }

    void expectRightValues(poll::ChannelSource& source, const poll::Block& block) {
        const int before = driver_.port().requests();
        const auto readings = source.read(block);
        const int requests = driver_.port().requests() - before;
        const ITag* first = tags_[block.tags.front()];
        if (engine_.CanBeOptimized(first, first, false)) {
            EXPECT_EQ(block.requests, requests) << first->GetVarName();
        }
        ASSERT_EQ(block.tags.size(), readings.size());
        for (std::size_t at = 0; at < readings.size(); ++at) {
            const auto alone = readAlone(engine_, tags_[block.tags[at]]);
            ASSERT_EQ(alone.has_value(), readings[at].good)
                << tags_[block.tags[at]]->GetVarName() << ' ' << readings[at].error.text;
            if (!alone) continue;
            EXPECT_EQ(*alone, readings[at].value) << tags_[block.tags[at]]->GetVarName();
        }
    }

    LoadedDriver driver_{5};
    IProtocol4& engine_ = driver_.answers();
    poll::CostModel costs_;
    std::vector<const ITag*> tags_;
    std::vector<poll::TagPlace> places_;
    poll::Plan plan_;
};

TEST_F(PlannedBlocksTest, AreAllowedByTheEngineAndRightForTenThousandLists) {
    RandomTags random(21);
    int shared = 0;
    for (int list = 0; list < kLists && !HasFailure(); ++list) {
        plan(random.list(kMostTags));
        expectEveryTagOnce();
        poll::ChannelSource source(driver_.channel(), tags_);
        for (const poll::Block& block : plan_.blocks) {
            if (block.tags.size() > 1) ++shared;
            expectAllowed(block);
            expectRightValues(source, block);
        }
        freeTags();
    }
    EXPECT_LT(kLists, shared);
}

TEST_F(PlannedBlocksTest, TagThatTheEngineRefusesTakesNoOtherAlong) {
    plan({"1?HREG?465535?short", "1?HREG?465536?int", "1?HREG?465536?short"});
    poll::ChannelSource source(driver_.channel(), tags_);
    int good = 0;
    for (const poll::Block& block : plan_.blocks)
        for (const poll::TagReading& reading : source.read(block))
            good += reading.good ? 1 : 0;
    EXPECT_EQ(2, good);
}

}  // namespace
