// The datagram rules of the base, on top of what a driver overrides.
#include <gtest/gtest.h>

#include <limits>
#include <set>
#include <utility>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

class CoexistingTags : public TestProtocol {
  public:
    bool CanCoexistInDatagram(const ITag* a, const ITag* b) const override {
        compared.emplace_back(a, b);
        return refused.count(a) == 0;
    }
    std::set<const ITag*> refused;  ///< These coexist with nothing.
    mutable std::vector<std::pair<const ITag*, const ITag*>> compared;
};

class CountedTags : public CoexistingTags {
  public:
    int MaxDatagramItems(const ITag*) const override { return maxItems; }
    int maxItems = 10;
};

class Datagrams : public CountedTags {
  public:
    int MaxDatagramLength(const ITag*) const override { return maxLength; }
    int ReadDatagram(const ITag* const*, int count, unsigned char*) override {
        counts.push_back(count);
        return readResult;
    }
    int maxLength = 10;
    std::vector<int> counts;
};

class ProtocolBaseDatagramTest : public testing::Test {
  protected:
    TestTag two_{"two", bytesShape(2)};
    TestTag three_{"three", bytesShape(3)};
    TestTag five_{"five", bytesShape(5)};
    const ITag* list_[2] = {&two_, &three_};
    unsigned char data_[16] = {};
    Datagrams protocol_;
};

TEST_F(ProtocolBaseDatagramTest, CandidateFitsUpToTheLastByte) {
    EXPECT_TRUE(protocol_.CanAddToDatagram(list_, 2, &five_));
    protocol_.maxLength = 9;
    EXPECT_FALSE(protocol_.CanAddToDatagram(list_, 2, &five_));
}

TEST_F(ProtocolBaseDatagramTest, CandidateNeedsAFreeItem) {
    protocol_.maxItems = 3;
    EXPECT_TRUE(protocol_.CanAddToDatagram(list_, 2, &five_));
    protocol_.maxItems = 2;
    EXPECT_FALSE(protocol_.CanAddToDatagram(list_, 2, &five_));
}

TEST_F(ProtocolBaseDatagramTest, OnlyTheFirstTagIsComparedWithTheCandidate) {
    protocol_.refused = {&three_};
    EXPECT_TRUE(protocol_.CanAddToDatagram(list_, 2, &five_));
    const std::vector<std::pair<const ITag*, const ITag*>> compared{{&two_, &five_}};
    EXPECT_EQ(compared, protocol_.compared);
    protocol_.refused = {&two_};
    EXPECT_FALSE(protocol_.CanAddToDatagram(list_, 2, &five_));
}

TEST_F(ProtocolBaseDatagramTest, EmptyDatagramTakesATagThatFits) {
    EXPECT_TRUE(protocol_.CanAddToDatagram(nullptr, 0, &five_));
    protocol_.maxLength = 4;
    EXPECT_FALSE(protocol_.CanAddToDatagram(nullptr, 0, &five_));
}

TEST_F(ProtocolBaseDatagramTest, WithoutAnItemLimitNothingIsAdded) {
    CoexistingTags protocol;
    EXPECT_FALSE(protocol.CanAddToDatagram(list_, 1, &five_));
}

TEST_F(ProtocolBaseDatagramTest, WithoutALengthLimitOnlyEmptyTagsAreAdded) {
    CountedTags protocol;
    const TestTag empty("empty", bytesShape(0));
    const ITag* empties[] = {&empty, &empty};
    EXPECT_TRUE(protocol.CanAddToDatagram(empties, 2, &empty));
    EXPECT_FALSE(protocol.CanAddToDatagram(empties, 2, &two_));
    EXPECT_FALSE(protocol.CanAddToDatagram(list_, 2, &empty));
}

TEST_F(ProtocolBaseDatagramTest, HugeTagsDoNotWrapTheSum) {
    const TestTag huge("huge", bytesShape(std::numeric_limits<int>::max()));
    const ITag* huges[] = {&huge, &huge};
    EXPECT_FALSE(protocol_.CanAddToDatagram(huges, 2, &huge));
}

TEST_F(ProtocolBaseDatagramTest, EveryItemOfASuccessfulReadIsDone) {
    idal_error_t status[3] = {-8, -8, -8};
    EXPECT_NE(protocol_.ReadDatagramWithStatus(list_, 2, data_, status), 0);
    EXPECT_EQ(1, status[0]);
    EXPECT_EQ(1, status[1]);
    EXPECT_EQ(-8, status[2]);
    EXPECT_EQ(std::vector<int>{2}, protocol_.counts);
}

TEST_F(ProtocolBaseDatagramTest, FailedReadLeavesStatusAndStamps) {
    protocol_.readResult = 0;
    idal_error_t status[2] = {-8, -8};
    unsigned long long stamps[2] = {4711, 4711};
    EXPECT_EQ(0, protocol_.ReadDatagramWithStatus(list_, 2, data_, status));
    EXPECT_EQ(0, protocol_.readDatagramWithTimestamp(list_, 2, data_, status, stamps));
    for (int i : {0, 1}) {
        EXPECT_EQ(-8, status[i]);
        EXPECT_EQ(4711u, stamps[i]);
    }
}

TEST_F(ProtocolBaseDatagramTest, ProtocolWithoutDatagramsLeavesStatusAndStamps) {
    TestProtocol protocol;
    idal_error_t status[2] = {-8, -8};
    unsigned long long stamps[2] = {4711, 4711};
    EXPECT_EQ(0, protocol.ReadDatagramWithStatus(list_, 2, data_, status));
    EXPECT_EQ(0, protocol.readDatagramWithTimestamp(list_, 2, data_, status, stamps));
    EXPECT_EQ(-8, status[0]);
    EXPECT_EQ(4711u, stamps[0]);
}

TEST_F(ProtocolBaseDatagramTest, AllItemsCarryOneStamp) {
    idal_error_t status[2] = {-8, -8};
    unsigned long long stamps[3] = {4711, 4712, 4713};
    const unsigned long long before = currentTimeStamp();
    EXPECT_EQ(1, protocol_.readDatagramWithTimestamp(list_, 2, data_, status, stamps));
    EXPECT_LE(before, stamps[0]);
    EXPECT_LE(stamps[0], currentTimeStamp());
    EXPECT_EQ(stamps[0], stamps[1]);
    EXPECT_EQ(4713u, stamps[2]);
    EXPECT_EQ(1, status[0]);
    EXPECT_EQ(1, status[1]);
}

TEST_F(ProtocolBaseDatagramTest, NoItemsStoreNothing) {
    for (int count : {0, -1}) {
        idal_error_t status[1] = {-8};
        unsigned long long stamps[1] = {4711};
        EXPECT_EQ(1, protocol_.readDatagramWithTimestamp(list_, count, data_, status, stamps));
        EXPECT_EQ(-8, status[0]) << count;
        EXPECT_EQ(4711u, stamps[0]) << count;
    }
}

TEST_F(ProtocolBaseDatagramTest, DriversOwnStatusesAreStampedAsTheyAre) {
    class OwnStatus : public TestProtocol {
      public:
        int ReadDatagramWithStatus(const ITag* const*, int, unsigned char*,
                                   idal_error_t* status) override {
            status[0] = 1;
            status[1] = -6;
            return 1;
        }
    };
    OwnStatus protocol;
    idal_error_t status[2] = {-8, -8};
    unsigned long long stamps[2] = {4711, 4711};
    EXPECT_EQ(1, protocol.readDatagramWithTimestamp(list_, 2, data_, status, stamps));
    EXPECT_EQ(1, status[0]);
    EXPECT_EQ(-6, status[1]);
    EXPECT_NE(stamps[0], 4711u);
    EXPECT_EQ(stamps[0], stamps[1]);
}

}  // namespace
