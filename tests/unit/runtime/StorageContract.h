// What every permanent storage of the run time must do, whatever it keeps its values in.
#pragma once

#include <gmock/gmock.h>

#include <array>
#include <cstddef>
#include <string>
#include <thread>
#include <vector>

#include "runtime/Storage.h"

/// `Maker` is default constructible and has a member `storage`, a reference or an object.
template <class Maker>
class StorageContract : public ::testing::Test {
  protected:
    runtime::Storage& storage() { return maker_.storage; }

  private:
    Maker maker_;
};

TYPED_TEST_SUITE_P(StorageContract);

TYPED_TEST_P(StorageContract, KeepsValuesOfEachType) {
    auto& storage = this->storage();
    storage.writeString("line1", "tempNode5", "0x0A");
    storage.writeBool("line1", "node3_ModiconMode", true);
    storage.writeInt("line1", "baud", -19200);
    EXPECT_STREQ("0x0A", storage.readString("line1", "tempNode5"));
    EXPECT_TRUE(storage.readBool("line1", "node3_ModiconMode"));
    EXPECT_EQ(-19200, storage.readInt("line1", "baud"));
    EXPECT_FALSE(storage.failed()) << storage.lastError();
}

TYPED_TEST_P(StorageContract, MissingKeysReadAsNothing) {
    auto& storage = this->storage();
    EXPECT_STREQ("", storage.readString("line1", "none"));
    EXPECT_FALSE(storage.readBool("line1", "none"));
    EXPECT_EQ(0, storage.readInt("line1", "none"));
    EXPECT_EQ(0, storage.hasKey("line1", "none"));
    EXPECT_EQ(0, storage.keyCount("line1"));
    EXPECT_STREQ("", storage.keyName("line1", 0));
    storage.removeKey("line1", "none");
    EXPECT_FALSE(storage.failed()) << storage.lastError();
}

TYPED_TEST_P(StorageContract, WritingReplacesValueAndType) {
    auto& storage = this->storage();
    storage.writeInt("line1", "key", 5);
    storage.writeString("line1", "key", "0x10");
    EXPECT_EQ(1, storage.keyCount("line1"));
    EXPECT_STREQ("0x10", storage.readString("line1", "key"));
    EXPECT_EQ(16, storage.readInt("line1", "key"));
    storage.writeBool("line1", "key", false);
    EXPECT_STREQ("0", storage.readString("line1", "key"));
}

TYPED_TEST_P(StorageContract, SectionsAndKeysAreComparedExactly) {
    auto& storage = this->storage();
    storage.writeInt("line1", "baud", 1);
    storage.writeInt("Line1", "baud", 2);
    storage.writeInt("line1", "Baud", 3);
    storage.writeInt("line1", "baud ", 4);
    storage.writeInt("", "", 5);
    EXPECT_EQ(1, storage.readInt("line1", "baud"));
    EXPECT_EQ(2, storage.readInt("Line1", "baud"));
    EXPECT_EQ(3, storage.readInt("line1", "Baud"));
    EXPECT_EQ(5, storage.readInt("", ""));
    EXPECT_THAT(storage.sections(), ::testing::ElementsAre("", "Line1", "line1"));
}

TYPED_TEST_P(StorageContract, HostileTextsAreJustTexts) {
    auto& storage = this->storage();
    const char* hostile = "x'); DROP TABLE settings; -- \"\xC3\xA4\xFF\n%";
    storage.writeString(hostile, hostile, hostile);
    EXPECT_STREQ(hostile, storage.readString(hostile, hostile));
    EXPECT_STREQ(hostile, storage.keyName(hostile, 0));
    EXPECT_FALSE(storage.failed()) << storage.lastError();
}

TYPED_TEST_P(StorageContract, KeysAreListedByteByByte) {
    auto& storage = this->storage();
    for (const char* key : {"b", "a", "B", "a1", "\xC3\xA4"})
        storage.writeInt("s", key, 1);
    ASSERT_EQ(5, storage.keyCount("s"));
    std::array<std::string, 5> keys;
    for (int index = 0; index < 5; ++index)
        keys[static_cast<std::size_t>(index)] = storage.keyName("s", index);
    EXPECT_THAT(keys, ::testing::ElementsAre("B", "a", "a1", "b", "\xC3\xA4"));
    EXPECT_STREQ("", storage.keyName("s", 5));
    EXPECT_STREQ("", storage.keyName("s", -1));
    EXPECT_EQ(5u, storage.entries("s").size());
    EXPECT_EQ("a1", storage.entries("s")[2].key);
}

TYPED_TEST_P(StorageContract, RemovedKeyIsGone) {
    auto& storage = this->storage();
    storage.writeInt("s", "a", 1);
    storage.writeInt("s", "b", 2);
    storage.removeKey("s", "a");
    EXPECT_EQ(0, storage.hasKey("s", "a"));
    EXPECT_NE(storage.hasKey("s", "b"), 0);
    EXPECT_EQ(1, storage.keyCount("s"));
    storage.removeKey("s", "b");
    EXPECT_TRUE(storage.sections().empty());
}

TYPED_TEST_P(StorageContract, TextsAreCopiedOnlyWhenTheyFit) {
    auto& storage = this->storage();
    storage.writeString("s", "key", "value");
    char buffer[8] = "#######";
    EXPECT_EQ(0, storage.readStringInto("s", "key", buffer, 5));
    EXPECT_EQ(0, storage.keyNameInto("s", 0, buffer, 3));
    EXPECT_EQ(0, storage.readStringInto("s", "none", buffer, 8));
    EXPECT_EQ(0, storage.keyNameInto("s", 1, buffer, 8));
    EXPECT_EQ(0, storage.readStringInto("s", "key", buffer, -1));
    EXPECT_EQ(0, storage.readStringInto("s", "key", nullptr, 8));
    EXPECT_STREQ("#######", buffer);
    EXPECT_NE(storage.readStringInto("s", "key", buffer, 6), 0);
    EXPECT_STREQ("value", buffer);
    EXPECT_EQ('#', buffer[6]);
    EXPECT_NE(storage.keyNameInto("s", 0, buffer, 4), 0);
    EXPECT_STREQ("key", buffer);
}

TYPED_TEST_P(StorageContract, NullArgumentsAreRefusedVisibly) {
    auto& storage = this->storage();
    storage.writeString("s", "key", nullptr);
    EXPECT_TRUE(storage.failed());
    storage.clearFailure();
    storage.writeInt(nullptr, "key", 1);
    EXPECT_TRUE(storage.failed());
    storage.clearFailure();
    EXPECT_EQ(0, storage.readInt("s", nullptr));
    EXPECT_TRUE(storage.failed());
    storage.clearFailure();
    EXPECT_EQ(0, storage.keyCount(nullptr));
    EXPECT_TRUE(storage.failed());
    EXPECT_TRUE(storage.sections().empty());
}

TYPED_TEST_P(StorageContract, AnswersToBothInterfaceNames) {
    auto& storage = this->storage();
    EXPECT_EQ(static_cast<IPermanentStorage*>(&storage), storage.ConvertTo("IPermanentStorage"));
    EXPECT_EQ(static_cast<IPermanentStorage2*>(&storage), storage.ConvertTo("IPermanentStorage2"));
    EXPECT_EQ(nullptr, storage.ConvertTo("IPermanentStorage3"));
}

TYPED_TEST_P(StorageContract, EachThreadKeepsItsOwnText) {
    auto& storage = this->storage();
    storage.writeString("s", "mine", "mine");
    storage.writeString("s", "other", "other");
    const char* mine = storage.readString("s", "mine");
    std::thread([&storage] { EXPECT_STREQ("other", storage.readString("s", "other")); }).join();
    EXPECT_STREQ("mine", mine);
}

TYPED_TEST_P(StorageContract, ThreadsLoseNoWrite) {
    auto& storage = this->storage();
    constexpr int kThreads = 4;
    constexpr int kKeys = 25;
    std::vector<std::thread> threads;
    threads.reserve(kThreads);
    for (int thread = 0; thread < kThreads; ++thread) {
        threads.emplace_back([&storage, thread] {
            const std::string section = "line" + std::to_string(thread);
            for (int key = 0; key < kKeys; ++key) {
                const std::string name = "key" + std::to_string(key);
                storage.writeInt(section.c_str(), name.c_str(), key);
                EXPECT_EQ(std::to_string(key), storage.readString(section.c_str(), name.c_str()));
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_FALSE(storage.failed()) << storage.lastError();
    for (int thread = 0; thread < kThreads; ++thread) {
        EXPECT_EQ(kKeys, storage.keyCount(("line" + std::to_string(thread)).c_str()));
    }
}

REGISTER_TYPED_TEST_SUITE_P(StorageContract, KeepsValuesOfEachType, MissingKeysReadAsNothing,
                            WritingReplacesValueAndType, SectionsAndKeysAreComparedExactly,
                            HostileTextsAreJustTexts, KeysAreListedByteByByte, RemovedKeyIsGone,
                            TextsAreCopiedOnlyWhenTheyFit, NullArgumentsAreRefusedVisibly,
                            AnswersToBothInterfaceNames, EachThreadKeepsItsOwnText,
                            ThreadsLoseNoWrite);
