#include "runtime/StoragePath.h"

#include <gtest/gtest.h>

namespace {

using namespace runtime;

TEST(StoragePathTest, StateHomeComesFirst) {
    EXPECT_EQ("/var/state/mrtu/overrides.db", storagePathFrom("/var/state", "/home/op"));
}

TEST(StoragePathTest, HomeIsTheFallback) {
    constexpr const char* kExpected = "/home/op/.local/state/mrtu/overrides.db";
    for (const char* state : {static_cast<const char*>(nullptr), "", "relative/state"}) {
        EXPECT_EQ(kExpected, storagePathFrom(state, "/home/op"))
            << (state != nullptr ? state : "unset");
    }
}

TEST(StoragePathTest, WithoutEitherThereIsNone) {
    EXPECT_EQ("", storagePathFrom(nullptr, nullptr));
    EXPECT_EQ("", storagePathFrom("", "home"));
}

TEST(StoragePathTest, DirectoryOfAFile) {
    EXPECT_EQ(".", directoryOf("overrides.db"));
    EXPECT_EQ("/", directoryOf("/overrides.db"));
    EXPECT_EQ("a", directoryOf("a/b.db"));
    EXPECT_EQ("/a/b", directoryOf("/a/b/c.db"));
}

}  // namespace
