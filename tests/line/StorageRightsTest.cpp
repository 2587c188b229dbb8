// A storage that may not be written, and one whose disk is full.
#include <gmock/gmock.h>
#include <sys/resource.h>

#include <csignal>

#include "tests/line/StorageFile.h"

namespace {

using runtime::SqliteStorage;
using ::testing::HasSubstr;

using StorageRightsTest = StorageFileTest;

TEST_F(StorageRightsTest, WriteProtectedFileIsReadAndNeverWritten) {
    open()->writeInt("line1", "baud", 19200);
    ASSERT_EQ(0, ::chmod(path.c_str(), 0444));
    {
        const auto storage = open();
        ASSERT_NE(storage, nullptr);
        EXPECT_TRUE(storage->readOnly());
        EXPECT_EQ(19200, storage->readInt("line1", "baud"));
        EXPECT_FALSE(storage->failed());

        storage->writeInt("line1", "baud", 300);
        EXPECT_TRUE(storage->failed());
        EXPECT_THAT(storage->lastError(), HasSubstr("readonly database"));
        EXPECT_EQ(19200, storage->readInt("line1", "baud"));
        storage->clearFailure();
        storage->removeKey("line1", "baud");
        EXPECT_TRUE(storage->failed());
    }
    EXPECT_FALSE(std::filesystem::exists(path + "-wal"));
    EXPECT_FALSE(std::filesystem::exists(path + "-shm"));
    ASSERT_EQ(0, ::chmod(path.c_str(), 0600));
    EXPECT_EQ(19200, open()->readInt("line1", "baud"));
}

TEST_F(StorageRightsTest, WriteProtectedFileShowsAlsoWhatOnlyItsLogHolds) {
    const pid_t writer = ::fork();
    if (writer == 0) {
        auto storage = SqliteStorage::open(path);
        if (!storage) ::_exit(1);
        storage.value()->writeInt("line1", "baud", 4800);
        ::_exit(0);  // Without closing: the value is in the log alone.
    }
    ASSERT_EQ(0, endOf(writer));
    ASSERT_GT(std::filesystem::file_size(path + "-wal"), 0u);
    ASSERT_EQ(0, ::chmod(path.c_str(), 0444));
    const auto storage = open();
    ASSERT_NE(storage, nullptr);
    EXPECT_TRUE(storage->readOnly());
    EXPECT_EQ(4800, storage->readInt("line1", "baud"));
}

TEST_F(StorageRightsTest, WriteProtectedEmptyFileHoldsNothing) {
    std::ofstream(path).close();
    ASSERT_EQ(0, ::chmod(path.c_str(), 0444));
    const auto storage = open();
    EXPECT_EQ(0, storage->keyCount("s"));
    EXPECT_FALSE(storage->failed());
    storage->writeInt("s", "k", 1);
    EXPECT_THAT(storage->lastError(), HasSubstr("empty and write-protected"));
}

/// Another user's process: no rights of root, neither on the file nor on its directory.
TEST_F(StorageRightsTest, UserWithoutRightsReadsAndSaysSo) {
    if (::geteuid() != 0) GTEST_SKIP() << "needs to be able to become another user";
    open()->writeInt("line1", "baud", 19200);
    ASSERT_EQ(0, ::chmod(folder.c_str(), 0755));
    ASSERT_EQ(0, ::chmod(path.c_str(), 0644));
    const auto asOther = [this] {
        constexpr uid_t kNobody = 65534;
        if (::setgid(kNobody) != 0 || ::setuid(kNobody) != 0) return 1;
        auto storage = SqliteStorage::open(path);
        if (!storage) return 2;
        if (!storage.value()->readOnly()) return 3;
        if (storage.value()->readInt("line1", "baud") != 19200) return 4;
        storage.value()->writeInt("line1", "baud", 1);
        if (!storage.value()->failed()) return 5;
        const auto secret = SqliteStorage::open("/root/mrtu-test/overrides.db");
        return secret ? 6 : 0;
    };
    const pid_t child = ::fork();
    if (child == 0) ::_exit(asOther());
    EXPECT_EQ(0, endOf(child));
    ASSERT_EQ(0, ::chmod(path.c_str(), 0600));
    const pid_t locked = ::fork();
    if (locked == 0) {
        const bool other = ::setgid(65534) == 0 && ::setuid(65534) == 0;
        const auto opened = SqliteStorage::open(path);
        const bool said = !opened && opened.error().text == path + ": Permission denied";
        ::_exit(other && said ? 0 : 1);
    }
    EXPECT_EQ(0, endOf(locked));
    EXPECT_EQ(19200, open()->readInt("line1", "baud"));
}

/// The child's files may not grow beyond a limit, which is what a full disk looks like to it.
/// @return the number of writes that were acknowledged before the first that was not, or minus
/// what else went wrong.
int writeUntilFull(const std::string& path) {
    ::signal(SIGXFSZ, SIG_IGN);
    const rlimit limit{200'000, 200'000};
    if (::setrlimit(RLIMIT_FSIZE, &limit) != 0) return -1;
    auto opened = SqliteStorage::open(path);
    if (!opened) return -2;
    SqliteStorage& storage = *opened.value();
    const std::string text(500, 't');
    for (int key = 0; key < 10'000; ++key) {
        const std::string name = "key" + std::to_string(key);
        storage.writeString("line1", name.c_str(), text.c_str());
        if (!storage.failed()) continue;
        if (storage.lastError().find("writing 'line1', '" + name) == std::string::npos) return -3;
        if (storage.hasKey("line1", name.c_str()) != 0) return -4;
        if (storage.readString("line1", "key0") != text) return -5;
        return storage.keyCount("line1") == key ? key : -6;
    }
    return -7;
}

TEST_F(StorageRightsTest, FullDiskFailsVisiblyAndLosesNothing) {
    int answers[2];
    ASSERT_EQ(0, ::pipe(answers));
    const pid_t child = ::fork();
    if (child == 0) {
        const int written = writeUntilFull(path);
        ::_exit(::write(answers[1], &written, sizeof written) == sizeof written ? 0 : 1);
    }
    int written = -100;
    ASSERT_EQ(ssize_t{sizeof written}, ::read(answers[0], &written, sizeof written));
    EXPECT_EQ(0, endOf(child));
    ::close(answers[0]);
    ::close(answers[1]);
    ASSERT_GT(written, 10);

    EXPECT_EQ("ok\n", ask("PRAGMA integrity_check"));
    const auto storage = open();
    ASSERT_NE(storage, nullptr);
    EXPECT_EQ(written, storage->keyCount("line1"));
    EXPECT_EQ(std::string(500, 't'), storage->readString("line1", "key3"));
    storage->writeInt("line1", "after", 1);
    EXPECT_FALSE(storage->failed()) << storage->lastError();
}

/// There is no room for SQLite's side files, so that it could not even read.
int readWhenFull(const std::string& path) {
    ::signal(SIGXFSZ, SIG_IGN);
    const rlimit limit{0, 0};
    if (::setrlimit(RLIMIT_FSIZE, &limit) != 0) return 1;
    auto opened = SqliteStorage::open(path);
    if (!opened) return 2;
    SqliteStorage& storage = *opened.value();
    if (storage.whyReadOnly().empty()) return 3;
    if (storage.readInt("line1", "baud") != 19200 || storage.failed()) return 4;
    storage.writeInt("line1", "baud", 300);
    if (storage.lastError().find(storage.whyReadOnly()) == std::string::npos) return 5;
    return storage.readInt("line1", "baud") == 19200 ? 0 : 6;
}

TEST_F(StorageRightsTest, FullDiskCanStillBeRead) {
    open()->writeInt("line1", "baud", 19200);
    const pid_t child = ::fork();
    if (child == 0) ::_exit(readWhenFull(path));
    EXPECT_EQ(0, endOf(child));
    EXPECT_EQ(19200, open()->readInt("line1", "baud"));
}

}  // namespace
