// Files that are not fit for a storage are refused and left as they are.
#include <gmock/gmock.h>

#include <set>

#include "tests/line/StorageFile.h"

namespace {

using runtime::SqliteStorage;
using runtime::StorageFault;
using ::testing::HasSubstr;
using ::testing::StartsWith;

struct UnfitStorageTest : StorageFileTest {
    void expectRefused(StorageFault fault, const std::string& text) const {
        const std::string before = contentOf(path);
        const std::string logBefore = contentOf(path + "-wal");
        const auto filesBefore = files();
        const auto opened = SqliteStorage::open(path);
        ASSERT_FALSE(opened);
        EXPECT_EQ(fault, opened.error().fault) << opened.error().text;
        EXPECT_THAT(opened.error().text, StartsWith(path + ": "));
        EXPECT_THAT(opened.error().text, HasSubstr(text));
        EXPECT_TRUE(contentOf(path) == before) << "the file was changed";
        EXPECT_TRUE(contentOf(path + "-wal") == logBefore) << "the log was changed";
        EXPECT_EQ(filesBefore, files());
    }
    std::set<std::string> files() const {
        std::set<std::string> names;
        for (const auto& entry : std::filesystem::directory_iterator(folder))
            names.insert(entry.path().filename());
        return names;
    }
    /// A storage of a few pages.
    void fill() const {
        const auto storage = open();
        for (int key = 0; key < 200; ++key) {
            storage->writeString("line1", ("key" + std::to_string(key)).c_str(),
                                 std::string(100, 'v').c_str());
        }
    }
};

TEST_F(UnfitStorageTest, TextFile) {
    std::ofstream(path) << "baud=9600\n";
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(UnfitStorageTest, LongTextFile) {
    std::ofstream(path) << std::string(20'000, 'x');
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(UnfitStorageTest, TruncatedStorage) {
    fill();
    std::filesystem::resize_file(path, std::filesystem::file_size(path) / 2);
    expectRefused(StorageFault::Damaged, "");
}

/// SQLite opens it and reads zeroes for what is missing: a node's address became 0, broadcast.
TEST_F(UnfitStorageTest, StorageThatLacksItsLastByte) {
    open()->writeString("MRTU", "tempNode5", "7");
    const auto size = std::filesystem::file_size(path);
    std::filesystem::resize_file(path, size - 1);
    expectRefused(StorageFault::Damaged, "damaged: " + std::to_string(size - 1) + " bytes of");
}

TEST_F(UnfitStorageTest, EveryTruncationOfAStorage) {
    open()->writeString("MRTU", "tempNode5", "7");
    const std::string whole = contentOf(path);
    for (std::size_t size = 1; size < whole.size(); size += size < 600 ? 1 : 293) {
        std::ofstream(path, std::ios::binary) << whole.substr(0, size);
        const auto opened = SqliteStorage::open(path);
        ASSERT_FALSE(opened) << size;
        EXPECT_EQ(StorageFault::Damaged, opened.error().fault) << size;
        EXPECT_EQ(size, std::filesystem::file_size(path));
    }
}

TEST_F(UnfitStorageTest, FileOfOneByte) {
    std::ofstream(path) << "S";
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(UnfitStorageTest, DatabaseOfAnotherProgramWithAnIdentOfItsOwn) {
    ask("PRAGMA journal_mode=WAL; PRAGMA application_id=7; CREATE TABLE bookmarks(url)");
    expectRefused(StorageFault::Foreign, "a database of another program");
}

TEST_F(UnfitStorageTest, StorageWithAnOverwrittenPage) {
    fill();
    {
        std::fstream file(path, std::ios::in | std::ios::out | std::ios::binary);
        file.seekp(2 * 4096 + 100);
        file << std::string(1000, '\xEE');
    }
    expectRefused(StorageFault::Damaged, "");
}

TEST_F(UnfitStorageTest, StorageWithAnOverwrittenSchema) {
    fill();
    {
        std::fstream file(path, std::ios::in | std::ios::out | std::ios::binary);
        file.seekp(100);
        file << std::string(3000, '\xEE');
    }
    expectRefused(StorageFault::Damaged, "");
}

TEST_F(UnfitStorageTest, DatabaseOfAnotherProgram) {
    ask("CREATE TABLE bookmarks(url); INSERT INTO bookmarks VALUES('x')");
    expectRefused(StorageFault::Foreign, "a database of another program");
    EXPECT_EQ("delete\n", ask("PRAGMA journal_mode"));
}

TEST_F(UnfitStorageTest, DatabaseOfAnotherProgramWithChangesInItsLog) {
    const pid_t writer = ::fork();
    if (writer == 0) {
        sqlite3* database = nullptr;
        sqlite3_open(path.c_str(), &database);
        sqlite3_exec(database, "PRAGMA journal_mode=WAL; CREATE TABLE bookmarks(url);", nullptr,
                     nullptr, nullptr);
        ::_exit(0);  // Without closing: the log stays.
    }
    ASSERT_EQ(0, endOf(writer));
    ASSERT_GT(std::filesystem::file_size(path + "-wal"), 0u);
    expectRefused(StorageFault::Foreign, "a database of another program");
}

TEST_F(UnfitStorageTest, StorageOfALaterVersion) {
    fill();
    ask("PRAGMA user_version=3");
    expectRefused(StorageFault::Newer, "layout 3 is not known");
}

TEST_F(UnfitStorageTest, StorageWithoutItsTable) {
    fill();
    ask("ALTER TABLE settings RENAME TO other");
    expectRefused(StorageFault::Damaged, "no such table: settings");
}

}  // namespace
