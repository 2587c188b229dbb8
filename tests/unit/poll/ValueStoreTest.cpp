#include "poll/ValueStore.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

const ValueStore::WallTime kNow{seconds{5}};

std::vector<TagReading> good(std::size_t tags, std::uint8_t value) {
    return std::vector<TagReading>(tags, TagReading{true, {value, value}, {}});
}

TEST(ValueStoreTest, ATagOutsideThePlanStaysNever) {
    SetupBuilder builder;
    builder.block(1, 0, 2, milliseconds{100});
    const ValueStore store(3, builder.setup().blocks);
    EXPECT_EQ(3U, store.tags().size());
    EXPECT_EQ(Quality::Never, store.tags()[2].quality);
}

TEST(ValueStoreTest, StaleKeepsItsFirstMomentAndBadHasNone) {
    SetupBuilder builder;
    builder.block(1, 0, 1, milliseconds{100});
    const std::vector<Block>& blocks = builder.setup().blocks;
    ValueStore store(1, blocks);
    store.take(0, blocks[0].tags, good(1, 7), true, kNow);
    store.lose(0, kSilent, kNow + seconds{1});
    store.lose(0, kSilent, kNow + seconds{2});
    EXPECT_EQ(kNow + seconds{1}, store.tags()[0].staleSince);
    EXPECT_EQ(kNow, store.tags()[0].at);
    const std::vector<TagReading> refused(1, TagReading{false, {}, kRefused});
    store.take(0, blocks[0].tags, refused, true, kNow + seconds{3});
    EXPECT_EQ(Quality::Bad, store.tags()[0].quality);
    EXPECT_FALSE(store.tags()[0].staleSince);
    EXPECT_EQ((std::vector<std::uint8_t>{7, 7}), store.tags()[0].value);
}

TEST(ValueStoreTest, ReadersNeverSeeTwoReadsOfOneBlock) {
    constexpr std::size_t kTags = 50;
    SetupBuilder builder;
    builder.block(1, 0, kTags, milliseconds{100}).block(2, 0, kTags, milliseconds{100});
    const std::vector<Block>& blocks = builder.setup().blocks;
    ValueStore store(2 * kTags, blocks);
    std::atomic<int> readers{2};
    const auto look = [&] {
        for (int i = 0; i < 1000; ++i) {
            const std::vector<TagState> tags = store.tags();
            for (std::size_t tag = 0; tag < kTags; ++tag) {
                ASSERT_EQ(tags[0].value, tags[tag].value);
                ASSERT_EQ(tags[kTags].count, tags[kTags + tag].count);
            }
        }
    };
    std::thread first([&] {
        look();
        --readers;
    });
    std::thread second([&] {
        look();
        --readers;
    });
    for (std::uint8_t value = 0; readers > 0; ++value)
        store.take(value % 2, blocks[value % 2].tags, good(kTags, value), true, kNow);
    first.join();
    second.join();
}

}  // namespace
}  // namespace poll
