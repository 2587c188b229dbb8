// Replaced node addresses and the ways in which a storage hands out its texts.
#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using Pairs = std::vector<std::pair<int, int>>;

class ReplacerCopyingReadsTest : public ReplacerTest {
  protected:
    AddressReplacerID replacer_;
};

TEST_F(ReplacerCopyingReadsTest, CopyingReadsGet256BytesEach) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((std::vector<std::string>{"keyCount(MRTU)", "keyNameInto(MRTU, 0, 256)",
                                        "readStringInto(MRTU, tempNode6, 256)"}),
              storage_.calls());
}

TEST_F(ReplacerCopyingReadsTest, RefusedKeyNamesAreEmptyAndSkipped) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    storage_.refuseCopies();
    replacer_.restore("MRTU");
    EXPECT_TRUE(replacer_.replacements().empty());
}

TEST_F(ReplacerCopyingReadsTest, TextTooLongForTheBufferIsEmpty) {
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

TEST_F(ReplacerCopyingReadsTest, ExtensionIsAskedForWithEveryKey) {
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

TEST_F(ReplacerCopyingReadsTest, CutTextOfAFailedCopyIsNotUsed) {
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

TEST_F(ReplacerCopyingReadsTest, NullTextsCountAsEmpty) {
    WordlessStorage wordless(contents_);
    piPermanentStorage = &wordless;
    contents_.put("MRTU", "tempNode1", std::string("9"));
    contents_.put("MRTU", "tempNode2", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{2, 0}}), replacer_.replacements());
}

}  // namespace
