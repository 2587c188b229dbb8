// Stored values that must not be used, and the listing of names.
#include <gmock/gmock.h>

#include "tests/line/StorageFile.h"

namespace {

using runtime::SqliteStorage;
using runtime::StoredValue;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

/// Node 5's address, seen the way a driver looks for it.
struct StorageValueTest : StorageFileTest {
    void SetUp() override {
        open()->writeString("MRTU", "tempNode5", "7");
        open()->writeString("MRTU", "tempNode6", "8");
        open()->writeBool("MRTU", "flag", true);
    }

    static std::vector<std::string> namesIn(SqliteStorage& storage, const char* section = "MRTU") {
        std::vector<std::string> names(static_cast<std::size_t>(storage.keyCount(section)));
        for (std::size_t index = 0; index < names.size(); ++index)
            names[index] = storage.keyName(section, static_cast<int>(index));
        return names;
    }
};

TEST_F(StorageValueTest, ThatWasNotAlteredIsUsed) {
    const auto storage = open();
    EXPECT_THAT(namesIn(*storage), ElementsAre("flag", "tempNode5", "tempNode6"));
    EXPECT_EQ("", unusedIn(*storage));
}

TEST_F(StorageValueTest, ThatWasAlteredIsKeptFromItsReaders) {
    ask("UPDATE settings SET value='0' WHERE key='tempNode5'");
    const auto storage = open();
    EXPECT_STREQ("", storage->readString("MRTU", "tempNode5"));
    char buffer[8] = "before";
    EXPECT_EQ(0, storage->readStringInto("MRTU", "tempNode5", buffer, 8));
    EXPECT_EQ(0, storage->hasKey("MRTU", "tempNode5"));
    EXPECT_THAT(namesIn(*storage), ElementsAre("flag", "tempNode6"));
    EXPECT_EQ(2U, storage->entries("MRTU").size());
    EXPECT_EQ("tempNode5: altered since it was written\n", unusedIn(*storage));
    EXPECT_FALSE(storage->failed()) << storage->lastError();
}

TEST_F(StorageValueTest, AnyPartOfTheRowThatWasAlteredIsNoticed) {
    const struct {
        const char* change;
        const char* section;
        const char* key;
    } rows[] = {
        {"UPDATE settings SET key='tempNode4' WHERE key='tempNode5'", "MRTU", "tempNode4"},
        {"UPDATE settings SET section='line2' WHERE key='tempNode6'", "line2", "tempNode6"},
        {"UPDATE settings SET type='int' WHERE key='flag'", "MRTU", "flag"},
        {"UPDATE settings SET sum=sum+1 WHERE key='flag'", "MRTU", "flag"},
    };
    for (const auto& row : rows) {
        ask(row.change);
        const auto storage = open();
        EXPECT_EQ(0, storage->hasKey(row.section, row.key)) << row.change;
        EXPECT_THAT(unusedIn(*storage, row.section),
                    HasSubstr(std::string(row.key) + ": altered since it was written\n"))
            << row.change;
    }
}

TEST_F(StorageValueTest, ThatWasAlteredIsReplacedByAWriteAndCanBeRemoved) {
    ask("UPDATE settings SET value='0' WHERE key LIKE 'tempNode%'");
    const auto storage = open();
    storage->writeString("MRTU", "tempNode5", "9");
    storage->removeKey("MRTU", "tempNode6");
    EXPECT_STREQ("9", storage->readString("MRTU", "tempNode5"));
    EXPECT_EQ("", unusedIn(*storage));
    EXPECT_EQ("flag\ntempNode5\n", ask("SELECT key FROM settings"));
}

TEST_F(StorageValueTest, ThatTheJudgeRefusesIsKeptFromItsReaders) {
    const auto judge = [](const std::string& key, const StoredValue& value) -> std::string {
        return key == "tempNode5" ? "not " + runtime::storedText(value) : "";
    };
    const auto opened = SqliteStorage::open(path, 100, judge);
    ASSERT_TRUE(opened);
    SqliteStorage& storage = *opened.value();
    EXPECT_EQ(0, storage.hasKey("MRTU", "tempNode5"));
    EXPECT_THAT(namesIn(storage), ElementsAre("flag", "tempNode6"));
    EXPECT_EQ("tempNode5: not 7\n", unusedIn(storage));
}

TEST_F(StorageValueTest, NamesFollowTheWritesOfThisAndOtherStorages) {
    const auto storage = open();
    EXPECT_THAT(namesIn(*storage), ElementsAre("flag", "tempNode5", "tempNode6"));
    storage->removeKey("MRTU", "flag");
    EXPECT_THAT(namesIn(*storage), ElementsAre("tempNode5", "tempNode6"));
    const auto other = open();
    other->writeString("MRTU", "tempNode1", "2");
    other->writeInt("line2", "baud", 9600);
    EXPECT_THAT(namesIn(*storage), ElementsAre("tempNode1", "tempNode5", "tempNode6"));
    EXPECT_THAT(namesIn(*storage, "line2"), ElementsAre("baud"));
    EXPECT_STREQ("", storage->keyName("MRTU", 3));
}

TEST_F(StorageValueTest, NamesOfTwoSectionsMayBeListedTurnByTurn) {
    const auto storage = open();
    storage->writeInt("line2", "a", 1);
    storage->writeInt("line2", "b", 2);
    EXPECT_STREQ("tempNode5", storage->keyName("MRTU", 1));
    EXPECT_STREQ("b", storage->keyName("line2", 1));
    EXPECT_STREQ("tempNode6", storage->keyName("MRTU", 2));
}

}  // namespace
