#include "runtime/MemoryStorage.h"

#include <gmock/gmock.h>

#include "tests/unit/runtime/StorageContract.h"

namespace {

using runtime::MemoryStorage;

struct MemoryMaker {
    MemoryStorage storage;
};

INSTANTIATE_TYPED_TEST_SUITE_P(InMemory, StorageContract, MemoryMaker);

TEST(MemoryStorageTest, RefusedWriteChangesNothingAndSaysWhy) {
    MemoryStorage storage;
    storage.writeInt("line1", "baud", 9600);
    storage.refuseWrites("no space left");
    storage.writeInt("line1", "baud", 300);
    storage.removeKey("line1", "baud");
    EXPECT_TRUE(storage.failed());
    EXPECT_EQ("no space left", storage.lastError());
    EXPECT_EQ(9600, storage.readInt("line1", "baud"));
    EXPECT_EQ(1, storage.writes());

    storage.refuseWrites("");
    storage.clearFailure();
    storage.writeInt("line1", "baud", 300);
    EXPECT_FALSE(storage.failed());
    EXPECT_EQ(300, storage.readInt("line1", "baud"));
}

TEST(MemoryStorageTest, RefusedReadFindsNothingAndSaysWhy) {
    MemoryStorage storage;
    storage.writeString("line1", "tempNode1", "7");
    storage.refuseReads("disk gone");
    char untouched[] = "before";
    EXPECT_STREQ("", storage.readString("line1", "tempNode1"));
    EXPECT_EQ(0, storage.keyCount("line1"));
    EXPECT_EQ(0, storage.readStringInto("line1", "tempNode1", untouched, sizeof untouched));
    EXPECT_STREQ("before", untouched);
    EXPECT_EQ("disk gone", storage.lastError());
}

}  // namespace
