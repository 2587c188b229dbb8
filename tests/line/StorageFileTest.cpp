// The storage's file: its birth, its look, and files that are not fit for it.
#include <gmock/gmock.h>
#include <sys/resource.h>

#include <csignal>
#include <set>

#include "tests/line/StorageFile.h"
#include "tests/unit/runtime/StorageContract.h"

namespace {

using runtime::SqliteStorage;
using runtime::StorageFault;
using ::testing::HasSubstr;
using ::testing::StartsWith;

/// A fresh storage in a directory of its own.
class SqliteMaker {
    struct Folder {
        Folder() { path = ::mkdtemp(path.data()); }
        ~Folder() { std::filesystem::remove_all(path); }
        std::string path = ::testing::TempDir() + "contract-XXXXXX";
    };
    Folder folder_;
    std::unique_ptr<SqliteStorage> owned_ =
        SqliteStorage::open(folder_.path + "/overrides.db").value();

  public:
    SqliteStorage& storage = *owned_;
};

INSTANTIATE_TYPED_TEST_SUITE_P(InSqlite, StorageContract, SqliteMaker);

TEST_F(StorageFileTest, ValuesOutlastTheStorage) {
    {
        const auto storage = open();
        storage->writeString("line1", "tempNode5", "9");
        storage->writeBool("line1", "node5_ModiconMode", true);
        storage->writeInt("line1", "baud", 19200);
    }
    const auto storage = open();
    EXPECT_STREQ("9", storage->readString("line1", "tempNode5"));
    EXPECT_TRUE(storage->readBool("line1", "node5_ModiconMode"));
    EXPECT_EQ(19200, storage->readInt("line1", "baud"));
}

TEST_F(StorageFileTest, ShellShowsSectionKeyTypeAndValue) {
    const auto storage = open();
    storage->writeString("line1", "tempNode5", "9");
    storage->writeBool("line1", "flag", true);
    storage->writeInt("line1", "baud", 19200);
    EXPECT_EQ("line1 baud int 19200\nline1 flag bool 1\nline1 tempNode5 text 9\n",
              ask("SELECT section||' '||key||' '||type||' '||value FROM settings ORDER BY key"));
    EXPECT_EQ("integer\ninteger\ntext\n", ask("SELECT typeof(value) FROM settings ORDER BY key"));
}

TEST_F(StorageFileTest, WritesGoThroughALogThatIsSynced) {
    const auto storage = open();
    storage->writeInt("s", "k", 1);
    EXPECT_EQ("wal\n", ask("PRAGMA journal_mode"));
    EXPECT_FALSE(storage->readOnly());
}

TEST_F(StorageFileTest, FilesAndDirectoriesAreForTheirOwnerAlone) {
    const mode_t before = ::umask(0);
    path = folder + "/state/mrtu/overrides.db";
    {
        const auto storage = open();
        storage->writeInt("s", "k", 1);
        for (const char* ending : {"", "-wal", "-shm"}) {
            EXPECT_EQ(0600u, modeOf(path + ending)) << ending;
        }
    }
    EXPECT_EQ(0700u, modeOf(folder + "/state"));
    EXPECT_EQ(0700u, modeOf(folder + "/state/mrtu"));
    ::umask(before);
}

TEST_F(StorageFileTest, NamesWithAMeaningInUrisAreJustNames) {
    for (const char* name : {"a?mode=memory", "50%41", "#1", "file:x", ":memory:", "bl ank"}) {
        path = folder + "/" + name;
        open()->writeInt("s", "k", 7);
        EXPECT_TRUE(std::filesystem::file_size(path) > 0) << name;
        EXPECT_EQ(7, open()->readInt("s", "k")) << name;
    }
}

TEST_F(StorageFileTest, BareNameMeansTheWorkingDirectory) {
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(folder);
    path = ":memory:";
    open()->writeInt("s", "k", 7);
    EXPECT_EQ(7, open()->readInt("s", "k"));
    std::filesystem::current_path(before);
    EXPECT_TRUE(std::filesystem::exists(folder + "/:memory:"));
}

TEST_F(StorageFileTest, LeadingSlashesAreNoHostName) {
    path = "//" + path;
    open()->writeInt("s", "k", 7);
    EXPECT_EQ(7, open()->readInt("s", "k"));
}

TEST_F(StorageFileTest, IsMadeByTheFirstWrite) {
    path = folder + "/state/overrides.db";
    const auto storage = open();
    EXPECT_EQ(0, storage->keyCount("s"));
    EXPECT_EQ(0, storage->hasKey("s", "k"));
    EXPECT_TRUE(storage->sections().empty());
    EXPECT_TRUE(storage->entries("s").empty());
    storage->removeKey("s", "k");
    EXPECT_FALSE(std::filesystem::exists(folder + "/state"));
    EXPECT_FALSE(storage->failed()) << storage->lastError();
    storage->writeInt("s", "k", 7);
    EXPECT_EQ(7, storage->readInt("s", "k"));
    EXPECT_EQ(7, open()->readInt("s", "k"));
}

TEST_F(StorageFileTest, ThatCannotBeMadeFailsAtTheFirstWrite) {
    const auto storage = open();
    std::filesystem::create_directory(path);
    EXPECT_FALSE(storage->failed());
    storage->writeInt("s", "k", 7);
    EXPECT_EQ(path + ": not a regular file", storage->lastError());
}

TEST_F(StorageFileTest, EmptyFileBecomesAStorage) {
    std::ofstream(path).close();
    EXPECT_EQ(0, open()->keyCount("s"));
    EXPECT_EQ(0u, std::filesystem::file_size(path));
    open()->writeInt("s", "k", 7);
    EXPECT_EQ(7, open()->readInt("s", "k"));
}

TEST_F(StorageFileTest, DirectoryThatCannotBeMadeIsNamed) {
    std::ofstream(folder + "/file") << "in the way";
    const auto opened = SqliteStorage::open(folder + "/file/sub/overrides.db");
    ASSERT_FALSE(opened);
    EXPECT_EQ(StorageFault::NoDirectory, opened.error().fault);
    EXPECT_EQ(folder + "/file/sub/overrides.db: cannot make " + folder + "/file: Not a directory",
              opened.error().text);
    EXPECT_EQ("in the way", contentOf(folder + "/file"));
}

TEST_F(StorageFileTest, DirectoryInPlaceOfTheFileIsRefused) {
    const auto opened = SqliteStorage::open(folder);
    ASSERT_FALSE(opened);
    EXPECT_EQ(StorageFault::CannotOpen, opened.error().fault);
    EXPECT_EQ(folder + ": not a regular file", opened.error().text);
}

TEST_F(StorageFileTest, EmptyNameIsRefused) {
    const auto opened = SqliteStorage::open("");
    ASSERT_FALSE(opened);
    EXPECT_EQ(StorageFault::CannotOpen, opened.error().fault);
}

}  // namespace
