// Where overrides are kept: files that are missing, full, read-only, damaged or altered.
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/stat.h>

#include <filesystem>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::contentsOf;
using cli_test::mrtu;
using cli_test::Outcome;
using cli_test::RunOptions;
using cli_test::scratchFile;

const std::string kUri = "5?HREG?400001?unsignedShort";
const std::string kOwnValue = kUri + " = 5000\n";
const std::string kOverriddenValue = kUri + " = 7000\n";

Outcome readWith(const std::string& storage, const RunOptions& options = {}) {
    return mrtu({"read", "--sim", "--storage", storage, kUri}, options);
}

Outcome setOn(const std::string& storage, const std::string& change,
              const RunOptions& options = {}) {
    return mrtu({"override", "set", "--sim", "--storage", storage, "node", change}, options);
}

bool has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

void execute(const std::string& file, const char* sql) {
    sqlite3* database = nullptr;
    ASSERT_EQ(SQLITE_OK, sqlite3_open(file.c_str(), &database));
    EXPECT_EQ(SQLITE_OK, sqlite3_exec(database, sql, nullptr, nullptr, nullptr));
    sqlite3_close(database);
}

TEST(StorageTest, ThatIsDamagedIsNamedAndLeftAlone) {
    const std::string file = scratchFile("damaged.db");
    const std::string garbage(4096, 'x');
    cli_test::writeFile(file, garbage);
    for (const char* const command : {"read", "override"}) {
        std::vector<std::string> words{command};
        if (command == std::string("override")) {
            words.insert(words.end(), {"set", "node", "5=7"});
        } else {
            words.push_back(kUri);
        }
        words.insert(words.end(), {"--sim", "--storage", file});
        const Outcome outcome = mrtu(words);
        EXPECT_EQ(1, outcome.exitCode) << command;
        EXPECT_EQ("", outcome.out) << command;
        EXPECT_NE(outcome.err.find(file), std::string::npos) << outcome.err;
        EXPECT_NE(outcome.err.find("--storage none"), std::string::npos) << outcome.err;
        EXPECT_EQ(garbage, contentsOf(file)) << command;
    }
}

TEST(StorageTest, ThatIsNotThereIsMadeByAChangeAlone) {
    const std::string folder = scratchFile("state");
    const std::string file = folder + "/overrides.db";
    EXPECT_EQ(kOwnValue, readWith(file).out);
    const Outcome list = mrtu({"override", "list", "--sim", "--storage", file});
    EXPECT_EQ(0, list.exitCode) << list.err;
    EXPECT_EQ("", list.err);
    EXPECT_EQ(0, mrtu({"override", "clear", "--storage", file, "all"}).exitCode);
    EXPECT_FALSE(std::filesystem::exists(folder));
    EXPECT_EQ("node 5 = 7 (stored)\n", setOn(file, "5=7").out);
    EXPECT_EQ(kOverriddenValue, readWith(file).out);
}

TEST(StorageTest, ThatCannotBeMadeStopsChangesAlone) {
    const std::string file = "/dev/null/x.db";
    const Outcome read = readWith(file);
    EXPECT_EQ(kOwnValue, read.out);
    EXPECT_EQ("mrtu: overrides are not kept: " + file +
                  ": cannot make /dev/null: Not a directory; --storage none does "
                  "without\n",
              read.err);
    EXPECT_EQ(0, read.exitCode);
    const Outcome set = setOn(file, "5=7");
    EXPECT_EQ(
        "mrtu: overrides are not kept: " + file + ": cannot make /dev/null: Not a directory\n",
        set.err);
    EXPECT_EQ(1, set.exitCode);
}

TEST(StorageTest, WithoutAHomeStopsChangesAlone) {
    const RunOptions homeless{.unset = {"HOME", "XDG_STATE_HOME"}};
    const cli_test::RunningSim sim({});
    const Outcome read = mrtu({"read", "--port", sim.device(), kUri}, homeless);
    EXPECT_EQ(kOwnValue, read.out);
    EXPECT_EQ(
        "mrtu: overrides are not kept: HOME is not set; --storage FILE names one; "
        "--storage none does without\n",
        read.err);
    EXPECT_EQ(0, read.exitCode);
    const Outcome set = mrtu({"override", "set", "--port", sim.device(), "node", "5=7"}, homeless);
    EXPECT_TRUE(has(set.err, "HOME is not set")) << set.err;
    EXPECT_EQ(1, set.exitCode);
}

TEST(StorageTest, OnAFullDiskIsReadAndNotChanged) {
    const std::string file = scratchFile("full.db");
    ASSERT_EQ(0, setOn(file, "5=7").exitCode);
    const RunOptions full{.diskFull = true};
    const Outcome read = readWith(file, full);
    EXPECT_EQ(kOverriddenValue, read.out);
    EXPECT_TRUE(has(read.err, file + ": overrides can only be read (")) << read.err;
    EXPECT_TRUE(has(read.err, "--storage none")) << read.err;
    EXPECT_EQ(0, read.exitCode);
    const Outcome set = setOn(file, "5=9", full);
    EXPECT_EQ(1, set.exitCode);
    EXPECT_TRUE(has(set.err, "storage: " + file)) << set.err;
    EXPECT_EQ(kOverriddenValue, readWith(file).out);
    const std::string missing = scratchFile("none.db");
    EXPECT_EQ(kOwnValue, readWith(missing, full).out);
    EXPECT_EQ(1, setOn(missing, "5=9", full).exitCode);
    EXPECT_EQ(kOwnValue, readWith(missing).out);
}

TEST(StorageTest, ThatMayOnlyBeReadIsReadWithAWarning) {
    const std::string file = scratchFile("readonly.db");
    ASSERT_EQ(0, setOn(file, "5=7").exitCode);
    ASSERT_EQ(0, chmod(file.c_str(), 0444));
    const Outcome read = readWith(file);
    EXPECT_EQ(kOverriddenValue, read.out);
    EXPECT_TRUE(has(read.err, "mrtu: " + file +
                                  ": overrides can only be read (write-protected); --storage none "
                                  "does without\n"))
        << read.err;
    EXPECT_EQ(0, read.exitCode);
    EXPECT_EQ(1, setOn(file, "5=9").exitCode);
}

TEST(StorageTest, ThatLacksItsLastByteIsRefused) {
    const std::string file = scratchFile("short.db");
    ASSERT_EQ(0, setOn(file, "5=7").exitCode);
    std::filesystem::resize_file(file, std::filesystem::file_size(file) - 1);
    const Outcome read = readWith(file);
    EXPECT_EQ("", read.out);
    EXPECT_TRUE(has(read.err, file + ": damaged")) << read.err;
    EXPECT_EQ(1, read.exitCode);
    EXPECT_FALSE(std::filesystem::exists(file + "-wal"));
    EXPECT_FALSE(std::filesystem::exists(file + "-shm"));
}

TEST(StorageTest, WithAnAlteredValueReportsItAndDoesNotUseIt) {
    const std::string file = scratchFile("altered.db");
    ASSERT_EQ(0, setOn(file, "5=7").exitCode);
    execute(file, "UPDATE settings SET value='9'");
    const Outcome read = readWith(file);
    EXPECT_EQ(kOwnValue, read.out);
    EXPECT_EQ(
        "mrtu: stored override tempNode5 is not used: altered since it was written\n"
        "mrtu: 'mrtu override clear' takes out what is not used\n",
        read.err);
    EXPECT_EQ(0, read.exitCode);
    EXPECT_EQ(0, mrtu({"override", "clear", "--storage", file, "all"}).exitCode);
    EXPECT_EQ("", readWith(file).err);
}

TEST(StorageTest, WithAnOverrideOutOfRangeReportsItAndDoesNotUseIt) {
    const std::string file = scratchFile("range.db");
    const Outcome console = mrtu({"console", "--sim", "--storage", file, "setid", "5", "300"});
    ASSERT_EQ("id 5 set to 300\n", console.out);
    const Outcome read = readWith(file);
    EXPECT_EQ(kOwnValue, read.out);
    EXPECT_TRUE(has(read.err,
                    "mrtu: stored override tempNode5 is not used: '300' is no address from 0 to "
                    "255\n"))
        << read.err;
}

// A key's number may be hexadecimal: the driver understands it, and so must the one who clears it.
TEST(StorageTest, ClearsAnUnusedOverrideHoweverItsNodeIsWritten) {
    const std::string file = scratchFile("spelling.db");
    ASSERT_EQ(0, setOn(file, "5=7").exitCode);
    execute(file, "UPDATE settings SET key='tempNode0x05'");
    EXPECT_TRUE(has(readWith(file).err, "tempNode0x05 is not used"));
    ASSERT_EQ(0, mrtu({"override", "clear", "--storage", file, "node", "5"}).exitCode);
    EXPECT_EQ("", readWith(file).err);
}

}  // namespace
