// Replaced node addresses on their way back out of the storage.
#include <string>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using Pairs = std::vector<std::pair<int, int>>;

/// Both kinds of storage: with the copying reads, and without.
class ReplacerRestoreTest : public ReplacerTest, public testing::WithParamInterface<bool> {
  protected:
    ReplacerRestoreTest() {
        if (!GetParam()) usePlainStorage();
    }

    AddressReplacerID replacer_;
};

INSTANTIATE_TEST_SUITE_P(Storage, ReplacerRestoreTest, testing::Bool(), [](const auto& storage) {
    return storage.param ? "WithCopyingReads" : "Plain";
});

TEST_P(ReplacerRestoreTest, EveryOverrideOfTheSectionIsRecorded) {
    contents_.put("MRTU", "tempNode12", std::string("7"));
    contents_.put("MRTU", "tempNode3", std::string("255"));
    contents_.put("other", "tempNode4", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{12, 7}, {3, 255}}), replacer_.replacements());
}

TEST_P(ReplacerRestoreTest, AddressAndReplacementHaveAutomaticBase) {
    contents_.put("MRTU", "tempNode0x0A", std::string("017"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{10, 15}}), replacer_.replacements());
}

TEST_P(ReplacerRestoreTest, KeysWithoutThePrefixAreIgnoredAndNotRead) {
    contents_.put("MRTU", "baud", 9600);
    contents_.put("MRTU", "node3_ModiconMode", true);
    contents_.put("MRTU", "tempNod", std::string("1"));
    contents_.put("MRTU", "TempNode4", std::string("1"));
    contents_.put("MRTU", " tempNode4", std::string("1"));
    replacer_.restore("MRTU");
    EXPECT_TRUE(replacer_.replacements().empty());
    EXPECT_EQ(0, storage_.count("readStringInto") + plainStorage_.count("readString"));
}

TEST_P(ReplacerRestoreTest, UnreadableNumbersAreZero) {
    contents_.put("MRTU", "tempNode", std::string("5"));
    contents_.put("MRTU", "tempNode8", std::string("abc"));
    contents_.put("MRTU", "tempNode9", 7);  // no text
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{0, 5}, {8, 0}, {9, 0}}), replacer_.replacements());
}

TEST_P(ReplacerRestoreTest, StoredValuesOverwriteAndOtherPairsStay) {
    replacer_.setValue(5, 1, nullptr);
    replacer_.setValue(6, 2, nullptr);
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{5, 1}, {6, 9}}), replacer_.replacements());
}

TEST_P(ReplacerRestoreTest, NothingIsWrittenBack) {
    contents_.put("MRTU", "tempNode6", std::string("6"));
    contents_.put("MRTU", "tempNode7", std::string("8"));
    replacer_.restore("MRTU");
    for (const char* operation : {"writeString", "writeInt", "writeBool", "removeKey"})
        EXPECT_EQ(0, storage_.count(operation) + plainStorage_.count(operation)) << operation;
    EXPECT_EQ("text:6", stored("tempNode6"));
}

TEST_P(ReplacerRestoreTest, WithoutSectionNothingHappens) {
    contents_.put("MRTU", "tempNode6", std::string("9"));
    replacer_.restore(nullptr);
    EXPECT_TRUE(replacer_.replacements().empty());
}

TEST_P(ReplacerRestoreTest, PersistedOverridesComeBack) {
    replacer_.setValue(12, 7, "MRTU");
    replacer_.setValue(13, 0, "MRTU");
    replacer_.setValue(14, 14, "MRTU");
    AddressReplacerID restarted;
    restarted.restore("MRTU");
    EXPECT_EQ((Pairs{{12, 7}, {13, 0}}), restarted.replacements());
}

}  // namespace
