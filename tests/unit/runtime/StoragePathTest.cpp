#include "runtime/StoragePath.h"

#include <gtest/gtest.h>

namespace {

using namespace runtime;

TEST(StoragePath, StateHomeComesFirst) {
    EXPECT_EQ(storagePathFrom("/var/state", "/home/op"), "/var/state/mrtu/overrides.db");
}

TEST(StoragePath, HomeIsTheFallback) {
    constexpr const char* kExpected = "/home/op/.local/state/mrtu/overrides.db";
    for (const char* state : {static_cast<const char*>(nullptr), "", "relative/state"}) {
        EXPECT_EQ(storagePathFrom(state, "/home/op"), kExpected)
            << (state != nullptr ? state : "unset");
    }
}

TEST(StoragePath, WithoutEitherThereIsNone) {
    EXPECT_EQ(storagePathFrom(nullptr, nullptr), "");
    EXPECT_EQ(storagePathFrom("", "home"), "");
}

TEST(StoragePath, DirectoryOfAFile) {
    EXPECT_EQ(directoryOf("overrides.db"), ".");
    EXPECT_EQ(directoryOf("/overrides.db"), "/");
    EXPECT_EQ(directoryOf("a/b.db"), "a");
    EXPECT_EQ(directoryOf("/a/b/c.db"), "/a/b");
}

}  // namespace
