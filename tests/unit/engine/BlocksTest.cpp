#include "engine/Blocks.h"

#include <gmock/gmock.h>

#include <vector>

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

std::vector<Blocks::Block> blocks(int count, int limit) {
    std::vector<Blocks::Block> all;
    for (const Blocks::Block block : Blocks(count, limit))
        all.push_back(block);
    return all;
}

}  // namespace

void PrintTo(const Blocks::Block& block, std::ostream* out) {
    *out << block.first << "+" << block.count;
}

TEST(BlocksTest, AFittingCountIsOneBlock) {
    EXPECT_THAT(blocks(1, 125), ElementsAre(Blocks::Block{0, 1}));
    EXPECT_THAT(blocks(125, 125), ElementsAre(Blocks::Block{0, 125}));
}

TEST(BlocksTest, OneMoreItemIsABlockOfItsOwn) {
    EXPECT_THAT(blocks(126, 125), ElementsAre(Blocks::Block{0, 125}, Blocks::Block{125, 1}));
}

TEST(BlocksTest, AMultipleOfTheLimitLeavesNoRest) {
    EXPECT_THAT(blocks(250, 125), ElementsAre(Blocks::Block{0, 125}, Blocks::Block{125, 125}));
}

TEST(BlocksTest, NothingGivesNoBlock) {
    EXPECT_THAT(blocks(0, 125), IsEmpty());
    EXPECT_THAT(blocks(-3, 125), IsEmpty());
}

TEST(BlocksTest, ALimitBelowOneCountsAsOne) {
    EXPECT_THAT(blocks(2, 0), ElementsAre(Blocks::Block{0, 1}, Blocks::Block{1, 1}));
    EXPECT_THAT(blocks(2, -7), ElementsAre(Blocks::Block{0, 1}, Blocks::Block{1, 1}));
}

TEST(BlocksTest, EveryItemIsCoveredOnceInOrder) {
    for (int count = 0; count < 60; ++count) {
        for (int limit = 1; limit < 20; ++limit) {
            int next = 0;
            for (const Blocks::Block block : Blocks(count, limit)) {
                ASSERT_EQ(next, block.first) << count << " by " << limit;
                ASSERT_GE(block.count, 1) << count << " by " << limit;
                ASSERT_LE(block.count, limit) << count << " by " << limit;
                next += block.count;
            }
            ASSERT_EQ(count, next) << "by " << limit;
        }
    }
}
