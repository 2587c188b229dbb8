// A host may plan by what the engine answers about tags: whatever it joins, every tag gets the
// value that it has when it is read alone.
#include <gtest/gtest.h>

#include <cstdlib>

#include "tests/unit/poll/AnswersHost.h"
#include "tests/unit/poll/LoadedDriver.h"
#include "tests/unit/poll/RandomTags.h"

namespace {

using namespace poll_test;

constexpr int kLists = 10000;
constexpr int kMostTags = 14;

class EngineAnswersTest : public testing::Test {
  protected:
    /// @param plan  Cuts a group into blocks.
    /// @return the blocks that hold more than one tag.
    template <class Planner>
    int expectRightValues(const std::vector<std::string>& uris, const Planner& host) {
        int shared = 0;
        const std::vector<const ITag*> tags = driver_.tags(uris);
        for (const auto& group : groupsOf(engine_, tags)) {
            for (const HostBlock& block : host.plan(engine_, group)) {
                if (block.size() > 1) ++shared;
                const auto values = readBlock(engine_, block);
                for (std::size_t index = 0; index < block.size(); ++index)
                    EXPECT_EQ(readAlone(engine_, block[index].tag), values[index])
                        << block[index].tag->GetVarName() << " in a block that begins with "
                        << block.front().tag->GetVarName() << " (" << block.size() << " tags)";
            }
        }
        for (const ITag* tag : tags)
            driver_.channel().freeTag(const_cast<ITag*>(tag));
        return shared;
    }

    LoadedDriver driver_{7};
    IProtocol4& engine_ = driver_.answers();
};

TEST_F(EngineAnswersTest, HostThatSpansGapsGetsRightValuesForTenThousandLists) {
    RandomTags random(11);
    int shared = 0;
    for (int list = 0; list < kLists && !HasFailure(); ++list) {
        const SpanningHost host{.mostGap = list % 50, .mostBytes = 20 + list % 300};
        shared += expectRightValues(random.list(kMostTags), host);
    }
    EXPECT_LT(kLists, shared);
}

TEST_F(EngineAnswersTest, HostThatChainsWhatTouchesGetsRightValuesForTenThousandLists) {
    RandomTags random(12);
    int shared = 0;
    for (int list = 0; list < kLists && !HasFailure(); ++list)
        shared += expectRightValues(random.list(kMostTags), ChainingHost{});
    EXPECT_LT(kLists / 10, shared);
}

}  // namespace
