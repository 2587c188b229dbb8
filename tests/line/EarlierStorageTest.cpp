// Storages of an earlier layout.
#include <gtest/gtest.h>

#include "tests/line/StorageFile.h"

namespace {

using runtime::SqliteStorage;

/// A storage as versions before the check sums wrote it.
struct EarlierStorageTest : StorageFileTest {
    void SetUp() override {
        ask("PRAGMA journal_mode=WAL;"
            "CREATE TABLE settings(section TEXT NOT NULL, key TEXT NOT NULL,"
            " type TEXT NOT NULL CHECK(type IN ('text','bool','int')),"
            " value NOT NULL CHECK(typeof(value) = CASE type WHEN 'text' THEN 'text' ELSE 'integer'"
            " END), PRIMARY KEY(section, key)) WITHOUT ROWID;"
            "PRAGMA application_id=1836217461; PRAGMA user_version=1;"
            "INSERT INTO settings VALUES('MRTU','tempNode5','text','7'),('MRTU','baud','int',300)");
    }
};

TEST_F(EarlierStorageTest, IsBroughtUpToDateWithItsValues) {
    {
        const auto storage = open();
        ASSERT_NE(storage, nullptr);
        EXPECT_STREQ("7", storage->readString("MRTU", "tempNode5"));
        EXPECT_EQ(300, storage->readInt("MRTU", "baud"));
    }
    EXPECT_EQ("2\n", ask("PRAGMA user_version"));
    ask("UPDATE settings SET value='8' WHERE key='tempNode5'");
    EXPECT_EQ("tempNode5: altered since it was written\n", unusedIn(*open()));
    EXPECT_EQ("ok\n", ask("PRAGMA integrity_check"));
}

TEST_F(EarlierStorageTest, ThatMayOnlyBeReadIsReadAsItIs) {
    ASSERT_EQ(0, ::chmod(path.c_str(), 0444));
    const std::string before = contentOf(path);
    {
        const auto storage = open();
        ASSERT_NE(storage, nullptr);
        EXPECT_STREQ("7", storage->readString("MRTU", "tempNode5"));
        EXPECT_EQ("", unusedIn(*storage));
        storage->writeString("MRTU", "tempNode5", "8");
        EXPECT_TRUE(storage->failed());
        EXPECT_STREQ("7", storage->readString("MRTU", "tempNode5"));
    }
    EXPECT_TRUE(contentOf(path) == before);
}

TEST_F(EarlierStorageTest, IsBroughtUpToDateByOneOfTwoProcesses) {
    pid_t children[2];
    for (pid_t& child : children) {
        child = ::fork();
        if (child == 0) {
            const auto opened = SqliteStorage::open(path);
            ::_exit(opened && opened.value()->readInt("MRTU", "baud") == 300 ? 0 : 1);
        }
    }
    for (const pid_t child : children)
        EXPECT_EQ(0, endOf(child));
    EXPECT_EQ("", unusedIn(*open()));
}

}  // namespace
