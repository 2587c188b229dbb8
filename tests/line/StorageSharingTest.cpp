// Several processes on one storage file.
#include <gmock/gmock.h>

#include "tests/line/StorageFile.h"

namespace {

using runtime::SqliteStorage;
using ::testing::HasSubstr;

constexpr int kWrites = 100;

/// @return 0 when every write was done.
int writeOwnAndSharedKeys(const std::string& path, int process) {
    auto opened = SqliteStorage::open(path);
    if (!opened) return 1;
    SqliteStorage& storage = *opened.value();
    for (int write = 0; write < kWrites; ++write) {
        const std::string own = "own" + std::to_string(process) + "_" + std::to_string(write);
        storage.writeInt("line1", own.c_str(), write);
        storage.writeInt("line1", "shared", process);
    }
    return storage.failed() ? 2 : 0;
}

using StorageSharingTest = StorageFileTest;

TEST_F(StorageSharingTest, TwoProcessesCreateAndFillOneFile) {
    pid_t children[2];
    for (int process = 0; process < 2; ++process) {
        children[process] = ::fork();
        if (children[process] == 0) ::_exit(writeOwnAndSharedKeys(path, process));
    }
    for (const pid_t child : children)
        EXPECT_EQ(0, endOf(child));
    const auto storage = open();
    ASSERT_NE(storage, nullptr);
    EXPECT_EQ(2 * kWrites + 1, storage->keyCount("line1"));
    for (int process = 0; process < 2; ++process) {
        for (int write = 0; write < kWrites; ++write) {
            const std::string own = "own" + std::to_string(process) + "_" + std::to_string(write);
            EXPECT_EQ(write, storage->readInt("line1", own.c_str())) << own;
        }
    }
    EXPECT_EQ("ok\n", ask("PRAGMA integrity_check"));
}

TEST_F(StorageSharingTest, OtherStoragesWritesAreSeen) {
    const auto one = open();
    const auto other = open();
    one->writeInt("line1", "baud", 9600);
    EXPECT_EQ(9600, other->readInt("line1", "baud"));
    other->removeKey("line1", "baud");
    EXPECT_EQ(0, one->hasKey("line1", "baud"));
}

TEST_F(StorageSharingTest, WriteThatWaitedTooLongFailsVisibly) {
    const auto patient = open();
    patient->writeInt("line1", "baud", 9600);
    auto impatient = SqliteStorage::open(path, 10);
    ASSERT_TRUE(impatient);

    sqlite3* holder = nullptr;
    ASSERT_EQ(SQLITE_OK, sqlite3_open(path.c_str(), &holder));
    ASSERT_EQ(SQLITE_OK, sqlite3_exec(holder, "BEGIN IMMEDIATE", nullptr, nullptr, nullptr));
    impatient.value()->writeInt("line1", "baud", 300);
    EXPECT_TRUE(impatient.value()->failed());
    EXPECT_THAT(impatient.value()->lastError(), HasSubstr("database is locked"));
    EXPECT_EQ(9600, impatient.value()->readInt("line1", "baud")) << "reading needs no lock";
    sqlite3_close(holder);

    impatient.value()->clearFailure();
    impatient.value()->writeInt("line1", "baud", 300);
    EXPECT_FALSE(impatient.value()->failed()) << impatient.value()->lastError();
    EXPECT_EQ(300, patient->readInt("line1", "baud"));
}

}  // namespace
