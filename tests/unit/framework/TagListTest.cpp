#include "framework/TagList.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <list>
#include <memory>
#include <new>
#include <random>
#include <vector>

#include "tests/support/MemoryShortage.h"
#include "tests/unit/framework/TestProtocol.h"

namespace {

using testing_support::MemoryShortage;

class TagListTest : public testing::Test {
  protected:
    TagListTest() {
        for (int i = 0; i < 8; ++i)
            tags_.push_back(std::make_unique<TestTag>("1", bytesShape(1)));
    }
    ITag* tag(std::size_t index) { return tags_[index].get(); }
    std::vector<ITag*> listed() const { return {list_.begin(), list_.end()}; }

    std::vector<std::unique_ptr<TestTag>> tags_;
    TagList list_;
};

TEST_F(TagListTest, KeepsTheOrderOfAdding) {
    for (const std::size_t index : {3U, 1U, 2U})
        list_.add(tag(index));
    EXPECT_EQ((std::vector<ITag*>{tag(3), tag(1), tag(2)}), listed());
    list_.remove(tag(1));
    EXPECT_EQ((std::vector<ITag*>{tag(3), tag(2)}), listed());
    list_.add(tag(1));
    EXPECT_EQ((std::vector<ITag*>{tag(3), tag(2), tag(1)}), listed());
    list_.clear();
    EXPECT_TRUE(listed().empty());
}

TEST_F(TagListTest, RemovesEveryEqualEntry) {
    for (const std::size_t index : {0U, 1U, 0U, 2U, 0U})
        list_.add(tag(index));
    list_.remove(tag(0));
    EXPECT_EQ((std::vector<ITag*>{tag(1), tag(2)}), listed());
}

TEST_F(TagListTest, NullAndForeignTagsChangeNothing) {
    list_.add(tag(0));
    list_.remove(nullptr);
    list_.remove(tag(1));
    EXPECT_EQ(std::vector<ITag*>{tag(0)}, listed());
}

TEST_F(TagListTest, DoesWhatAPlainListDoes) {
    std::mt19937 random(1);
    std::list<ITag*> plain;
    for (int step = 0; step < 5000; ++step) {
        ITag* each = tag(random() % tags_.size());
        if (random() % 2 == 0) {
            list_.add(each);
            plain.push_back(each);
        } else {
            list_.remove(each);
            plain.remove(each);
        }
        ASSERT_TRUE(std::equal(plain.begin(), plain.end(), list_.begin(), list_.end())) << step;
    }
}

TEST_F(TagListTest, StaysAsItWasWhenMemoryIsShort) {
    list_.add(tag(0));
    int refused = 0;
    for (bool added = false; !added; refused += added ? 0 : 1) {
        try {
            const MemoryShortage shortage(refused);
            list_.add(tag(1));
            added = true;
        } catch (const std::bad_alloc&) {
            ASSERT_EQ(std::vector<ITag*>{tag(0)}, listed()) << refused;
        }
    }
    EXPECT_GT(refused, 1);
    {
        const MemoryShortage shortage;
        list_.remove(tag(0));
    }
    EXPECT_EQ(std::vector<ITag*>{tag(1)}, listed());
}

TEST_F(TagListTest, GrowsOnlyWhenThereIsMemoryForTheIndexToo) {
    std::vector<ITag*> added;
    for (int round = 0; round < 500; ++round) {
        ITag* each = tag(static_cast<std::size_t>(round) % tags_.size());
        try {
            const MemoryShortage shortage(2);  // an entry and its place, none to widen the index
            list_.add(each);
        } catch (const std::bad_alloc&) {
            ASSERT_EQ(added, listed());
            list_.add(each);
        }
        added.push_back(each);
    }
    EXPECT_EQ(added, listed());
}

}  // namespace
