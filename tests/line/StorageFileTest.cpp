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

/// Files that must be refused and left as they are.
struct Unfit : StorageFileTest {
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

TEST_F(Unfit, TextFile) {
    std::ofstream(path) << "baud=9600\n";
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(Unfit, LongTextFile) {
    std::ofstream(path) << std::string(20'000, 'x');
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(Unfit, TruncatedStorage) {
    fill();
    std::filesystem::resize_file(path, std::filesystem::file_size(path) / 2);
    expectRefused(StorageFault::Damaged, "");
}

/// SQLite opens it and reads zeroes for what is missing: a node's address became 0, broadcast.
TEST_F(Unfit, StorageThatLacksItsLastByte) {
    open()->writeString("MRTU", "tempNode5", "7");
    const auto size = std::filesystem::file_size(path);
    std::filesystem::resize_file(path, size - 1);
    expectRefused(StorageFault::Damaged, "damaged: " + std::to_string(size - 1) + " bytes of");
}

TEST_F(Unfit, EveryTruncationOfAStorage) {
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

TEST_F(Unfit, FileOfOneByte) {
    std::ofstream(path) << "S";
    expectRefused(StorageFault::Damaged, "not a database");
}

TEST_F(Unfit, DatabaseOfAnotherProgramWithAnIdentOfItsOwn) {
    ask("PRAGMA journal_mode=WAL; PRAGMA application_id=7; CREATE TABLE bookmarks(url)");
    expectRefused(StorageFault::Foreign, "a database of another program");
}

TEST_F(Unfit, StorageWithAnOverwrittenPage) {
    fill();
    {
        std::fstream file(path, std::ios::in | std::ios::out | std::ios::binary);
        file.seekp(2 * 4096 + 100);
        file << std::string(1000, '\xEE');
    }
    expectRefused(StorageFault::Damaged, "");
}

TEST_F(Unfit, StorageWithAnOverwrittenSchema) {
    fill();
    {
        std::fstream file(path, std::ios::in | std::ios::out | std::ios::binary);
        file.seekp(100);
        file << std::string(3000, '\xEE');
    }
    expectRefused(StorageFault::Damaged, "");
}

TEST_F(Unfit, DatabaseOfAnotherProgram) {
    ask("CREATE TABLE bookmarks(url); INSERT INTO bookmarks VALUES('x')");
    expectRefused(StorageFault::Foreign, "a database of another program");
    EXPECT_EQ("delete\n", ask("PRAGMA journal_mode"));
}

TEST_F(Unfit, DatabaseOfAnotherProgramWithChangesInItsLog) {
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

TEST_F(Unfit, StorageOfALaterVersion) {
    fill();
    ask("PRAGMA user_version=3");
    expectRefused(StorageFault::Newer, "layout 3 is not known");
}

TEST_F(Unfit, StorageWithoutItsTable) {
    fill();
    ask("ALTER TABLE settings RENAME TO other");
    expectRefused(StorageFault::Damaged, "no such table: settings");
}

TEST_F(StorageFileTest, WriteProtectedFileIsReadAndNeverWritten) {
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

TEST_F(StorageFileTest, WriteProtectedFileShowsAlsoWhatOnlyItsLogHolds) {
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

TEST_F(StorageFileTest, WriteProtectedEmptyFileHoldsNothing) {
    std::ofstream(path).close();
    ASSERT_EQ(0, ::chmod(path.c_str(), 0444));
    const auto storage = open();
    EXPECT_EQ(0, storage->keyCount("s"));
    EXPECT_FALSE(storage->failed());
    storage->writeInt("s", "k", 1);
    EXPECT_THAT(storage->lastError(), HasSubstr("empty and write-protected"));
}

/// Another user's process: no rights of root, neither on the file nor on its directory.
TEST_F(StorageFileTest, UserWithoutRightsReadsAndSaysSo) {
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

TEST_F(StorageFileTest, FullDiskFailsVisiblyAndLosesNothing) {
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

TEST_F(StorageFileTest, FullDiskCanStillBeRead) {
    open()->writeInt("line1", "baud", 19200);
    const pid_t child = ::fork();
    if (child == 0) ::_exit(readWhenFull(path));
    EXPECT_EQ(0, endOf(child));
    EXPECT_EQ(19200, open()->readInt("line1", "baud"));
}

}  // namespace
