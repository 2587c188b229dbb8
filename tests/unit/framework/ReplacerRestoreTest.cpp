// Replaced node addresses on their way back out of the storage.
#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using Pairs = std::vector<std::pair<int, int>>;

class ReplacerRestoreDetail : public ReplacerTest {
  protected:
    AddressReplacerID replacer_;
};

/// Both kinds of storage: with the copying reads, and without.
class ReplacerRestore : public ReplacerRestoreDetail, public testing::WithParamInterface<bool> {
  protected:
    ReplacerRestore() {
        if (!GetParam()) usePlainStorage();
    }
};

INSTANTIATE_TEST_SUITE_P(Storage, ReplacerRestore, testing::Bool(), [](const auto& storage) {
    return storage.param ? "WithCopyingReads" : "Plain";
});

TEST_P(ReplacerRestore, EveryOverrideOfTheSectionIsRecorded) {
    contents_.put("MRTU", "tempNode12", std::string("7"));
    contents_.put("MRTU", "tempNode3", std::string("255"));
    contents_.put("other", "tempNode4", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{12, 7}, {3, 255}}), replacer_.replacements());
}

TEST_P(ReplacerRestore, AddressAndReplacementHaveAutomaticBase) {
    contents_.put("MRTU", "tempNode0x0A", std::string("017"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{10, 15}}), replacer_.replacements());
}

TEST_P(ReplacerRestore, KeysWithoutThePrefixAreIgnoredAndNotRead) {
    contents_.put("MRTU", "baud", 9600);
    contents_.put("MRTU", "node3_ModiconMode", true);
    contents_.put("MRTU", "tempNod", std::string("1"));
    contents_.put("MRTU", "TempNode4", std::string("1"));
    contents_.put("MRTU", " tempNode4", std::string("1"));
    replacer_.restore("MRTU");
    EXPECT_TRUE(replacer_.replacements().empty());
    EXPECT_EQ(0, storage_.count("readStringInto") + plainStorage_.count("readString"));
}

TEST_P(ReplacerRestore, UnreadableNumbersAreZero) {
    contents_.put("MRTU", "tempNode", std::string("5"));
    contents_.put("MRTU", "tempNode8", std::string("abc"));
    contents_.put("MRTU", "tempNode9", 7);  // no text
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{0, 5}, {8, 0}, {9, 0}}), replacer_.replacements());
}

TEST_P(ReplacerRestore, StoredValuesOverwriteAndOtherPairsStay) {
    replacer_.setValue(5, 1, nullptr);
    replacer_.setValue(6, 2, nullptr);
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{5, 1}, {6, 9}}), replacer_.replacements());
}

TEST_P(ReplacerRestore, NothingIsWrittenBack) {
    contents_.put("MRTU", "tempNode6", std::string("6"));
    contents_.put("MRTU", "tempNode7", std::string("8"));
    replacer_.restore("MRTU");
    for (const char* operation : {"writeString", "writeInt", "writeBool", "removeKey"})
        EXPECT_EQ(0, storage_.count(operation) + plainStorage_.count(operation)) << operation;
    EXPECT_EQ("text:6", stored("tempNode6"));
}

TEST_P(ReplacerRestore, WithoutSectionNothingHappens) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore(nullptr);
    EXPECT_TRUE(replacer_.replacements().empty());
}

TEST_P(ReplacerRestore, PersistedOverridesComeBack) {
    replacer_.setValue(12, 7, "MRTU");
    replacer_.setValue(13, 0, "MRTU");
    replacer_.setValue(14, 14, "MRTU");
    AddressReplacerID restarted;
    restarted.restore("MRTU");
    EXPECT_EQ((Pairs{{12, 7}, {13, 0}}), restarted.replacements());
}

TEST_F(ReplacerRestoreDetail, CopyingReadsGet256BytesEach) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((std::vector<std::string>{"keyCount(MRTU)", "keyNameInto(MRTU, 0, 256)",
                                        "readStringInto(MRTU, tempNode6, 256)"}),
              storage_.calls());
}

TEST_F(ReplacerRestoreDetail, RefusedKeyNamesAreEmptyAndSkipped) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    storage_.refuseCopies();
    replacer_.restore("MRTU");
    EXPECT_TRUE(replacer_.replacements().empty());
}

TEST_F(ReplacerRestoreDetail, TextTooLongForTheBufferIsEmpty) {
    contents_.put("MRTU", "tempNode6", std::string(255, ' ') + "9");
    contents_.put("MRTU", "tempNode7", std::string(254, ' ') + "9");
    contents_.put("MRTU", "tempNode8" + std::string(300, '8'), std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{6, 0}, {7, 9}}), replacer_.replacements());
}

/// A storage that offers its copying reads with every other query only. A copy that fails leaves
/// the text that fits behind.
class MoodyStorage final : public testing_support::StorageOperations<IPermanentStorage2> {
  public:
    using StorageOperations::StorageOperations;
    void* ConvertTo(const char* name) override {
        if (!CompareInterface(name, "IPermanentStorage2")) return nullptr;
        return ++queries % 2 == 0 ? this : nullptr;
    }
    const char* GetImpName() const override { return "MoodyStorage"; }
    int readStringInto(const char* section, const char* key, char* buffer, int size) override {
        return copyOut(textOf(section, key), buffer, size);
    }
    int keyNameInto(const char* section, int index, char* buffer, int size) override {
        ++copiedKeys;
        return copyOut(nameOf(section, index), buffer, size);
    }
    int queries = 0;
    int copiedKeys = 0;

  private:
    static int copyOut(const std::string& text, char* buffer, int size) {
        return std::snprintf(buffer, static_cast<std::size_t>(size), "%s", text.c_str()) < size ? 1
                                                                                                : 0;
    }
};

TEST_F(ReplacerRestoreDetail, ExtensionIsAskedForWithEveryKey) {
    MoodyStorage moody(contents_);
    piPermanentStorage = &moody;
    for (int node : {1, 2, 3, 4})
        contents_.put("MRTU", "tempNode" + std::to_string(node), std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{1, 9}, {2, 9}, {3, 9}, {4, 9}}), replacer_.replacements());
    EXPECT_EQ(4, moody.queries);
    EXPECT_EQ(2, moody.copiedKeys);
    EXPECT_EQ(2, moody.count("keyName"));
    EXPECT_EQ(2, moody.count("readString"));
}

TEST_F(ReplacerRestoreDetail, CutTextOfAFailedCopyIsNotUsed) {
    MoodyStorage moody(contents_);
    piPermanentStorage = &moody;
    contents_.put("MRTU", "tempNode1", std::string("9"));
    contents_.put("MRTU", "tempNode2", "9" + std::string(300, ' '));
    replacer_.restore("MRTU");
    EXPECT_EQ(1, moody.copiedKeys);
    EXPECT_EQ((Pairs{{1, 9}, {2, 0}}), replacer_.replacements());
}

/// Answers null where a text is due.
class WordlessStorage final : public testing_support::StorageOperations<IPermanentStorage> {
  public:
    using StorageOperations::StorageOperations;
    void* ConvertTo(const char*) override { return nullptr; }
    const char* GetImpName() const override { return "WordlessStorage"; }
    const char* readString(const char*, const char*) override { return nullptr; }
    const char* keyName(const char* section, int index) override {
        return index == 0 ? nullptr : StorageOperations::keyName(section, index);
    }
};

TEST_F(ReplacerRestoreDetail, NullTextsCountAsEmpty) {
    WordlessStorage wordless(contents_);
    piPermanentStorage = &wordless;
    contents_.put("MRTU", "tempNode1", std::string("9"));
    contents_.put("MRTU", "tempNode2", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{2, 0}}), replacer_.replacements());
}

}  // namespace
