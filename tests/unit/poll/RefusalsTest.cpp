#include "poll/Refusals.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

/// A block of `tags` registers `stride` items apart, and a device that refuses some items.
class RefusalsTest : public testing::Test {
  protected:
    static constexpr seconds kRetry{60};

    void build(std::size_t tags, long stride = 1) {
        for (std::size_t tag = 0; tag < tags; ++tag) {
            places_.emplace_back().first = static_cast<long>(tag) * stride;
            block_.tags.push_back(tag);
        }
        block_.items = static_cast<long>(tags - 1) * stride + 1;
        refusals_.emplace(block_, places_, kRetry);
    }
    bool isRefused(const Block& part) const {
        const auto touched = refused_.lower_bound(part.first);
        return touched != refused_.end() && *touched < part.first + part.items;
    }
    /// @return the reads of one round, e.g. "0..9 10..19".
    std::string round() {
        std::string reads;
        read_.clear();
        refusals_->begin(now_);
        while (const Block* part = refusals_->next()) {
            const long last = part->first + part->items - 1;
            if (!reads.empty()) reads += ' ';
            reads += std::to_string(part->first) + ".." + std::to_string(last);
            answer(*part);
        }
        return reads;
    }
    void answer(const Block& part) {
        if (isNoisy_) return refusals_->failed();
        if (isRefused(part)) return void(refusals_->refused(now_));
        read_.insert(part.tags.begin(), part.tags.end());
        refusals_->accepted();
    }
    static std::size_t readsIn(const std::string& round) {
        return round.empty()
                   ? 0U
                   : 1U + static_cast<std::size_t>(std::count(round.begin(), round.end(), ' '));
    }

    std::vector<TagPlace> places_;
    Block block_;
    std::optional<Refusals> refusals_;
    std::set<long> refused_;
    bool isNoisy_ = false;
    std::set<std::size_t> read_;  // Tags, by the last round.
    Refusals::TimePoint now_{seconds{1}};
};

TEST_F(RefusalsTest, AnAcceptedBlockIsOneRead) {
    build(8);
    EXPECT_EQ("0..7", round());
    EXPECT_EQ("0..7", round());
}

TEST_F(RefusalsTest, OneRefusalMayBeAMistake) {
    build(8);
    refused_ = {3};
    EXPECT_EQ("0..7", round());
    refused_.clear();
    EXPECT_EQ("0..7", round());
    refused_ = {3};
    EXPECT_EQ("0..7", round());
    EXPECT_FALSE(refusals_->isSplit());
}

TEST_F(RefusalsTest, NoiseNeverSplitsABlock) {
    build(8);
    isNoisy_ = true;
    for (int i = 0; i < 10; ++i)
        EXPECT_EQ("0..7", round());
    EXPECT_FALSE(refusals_->isSplit());
}

TEST_F(RefusalsTest, TheSecondRefusalFindsTheHoleInTheSameRound) {
    build(8);
    refused_ = {3};
    round();
    EXPECT_EQ("0..7 0..3 0..1 2..3 2..2 3..3 4..7", round());
    EXPECT_EQ(1U, refusals_->holes());
    EXPECT_EQ(7U, read_.size());
}

TEST_F(RefusalsTest, AHoleAmongAHundredTakesFewRequests) {
    for (long hole = 0; hole < 100; ++hole) {
        places_.clear();
        block_ = {};
        build(100);
        refused_ = {hole};
        round();
        EXPECT_LE(readsIn(round()), 15U) << hole;  // 1 + 2 * 7 halvings
        EXPECT_EQ(99U, read_.size()) << hole;
        for (int i = 0; i < 8; ++i)
            round();
        EXPECT_LE(readsIn(round()), 2U) << hole;  // in front of it and behind it
        EXPECT_EQ(99U, read_.size()) << hole;
    }
}

TEST_F(RefusalsTest, ARefusedGapBetweenTagsLosesNoTag) {
    build(8, 10);
    refused_ = {35};  // between the fourth tag and the fifth
    for (int i = 0; i < 6; ++i)
        round();
    EXPECT_EQ("0..30 40..70", round());
    EXPECT_EQ(0U, refusals_->holes());
    EXPECT_EQ(8U, read_.size());
}

TEST_F(RefusalsTest, AHoleIsTriedAgainAfterItsTime) {
    build(8);
    refused_ = {3};
    for (int i = 0; i < 6; ++i)
        round();
    EXPECT_EQ("0..2 4..7", round());
    now_ += kRetry;
    EXPECT_EQ("0..7 0..2 3..3 4..7", round());
    EXPECT_EQ("0..2 4..7", round());
    refused_.clear();
    now_ += kRetry;
    EXPECT_EQ("0..7", round());
    EXPECT_FALSE(refusals_->isSplit());
    EXPECT_EQ("0..7", round());
}

TEST_F(RefusalsTest, OneOfTwoHolesThatHealsIsJoinedAgain) {
    build(8);
    refused_ = {2, 6};
    for (int i = 0; i < 8; ++i)
        round();
    EXPECT_EQ("0..1 3..5 7..7", round());
    refused_ = {6};
    now_ += kRetry;
    round();
    for (int i = 0; i < 4; ++i)
        round();
    EXPECT_EQ("0..5 7..7", round());
    EXPECT_EQ(1U, refusals_->holes());
}

TEST_F(RefusalsTest, ManyHolesTakeTurnsToBeTried) {
    build(40);
    for (long item = 0; item < 40; ++item)
        refused_.insert(item);
    round();
    round();
    EXPECT_EQ(40U, refusals_->holes());
    EXPECT_EQ("", round());
    std::set<std::string> tried;
    for (int i = 0; i < 5; ++i) {
        now_ += kRetry;
        const std::string reads = round();
        EXPECT_EQ(1U + Refusals::kTrials, readsIn(reads));
        tried.insert(reads);
    }
    EXPECT_EQ(5U, tried.size());
}

TEST_F(RefusalsTest, ATagOfItsOwnBlockBecomesAHoleAndComesBack) {
    build(1);
    refused_ = {0};
    EXPECT_EQ("0..0", round());
    EXPECT_EQ("0..0", round());
    EXPECT_EQ("", round());
    now_ += kRetry;
    EXPECT_EQ("0..0", round());
    EXPECT_EQ("", round());
    refusals_->retrySoon();
    refused_.clear();
    EXPECT_EQ("0..0", round());
    EXPECT_EQ("0..0", round());
}

TEST_F(RefusalsTest, APartThatIsRefusedLaterIsLookedIntoToo) {
    build(8);
    refused_ = {3};
    for (int i = 0; i < 6; ++i)
        round();
    refused_ = {3, 5};
    EXPECT_EQ("0..2 4..7", round());
    EXPECT_EQ("0..2 4..7 4..5 4..4 5..5 6..7", round());
    EXPECT_EQ(2U, refusals_->holes());
}

}  // namespace
}  // namespace poll
