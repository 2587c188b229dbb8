// Replaced node addresses and their way into the storage.
#include <limits>
#include <string>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using Pairs = std::vector<std::pair<int, int>>;

class ReplacerAddress : public ReplacerTest {
  protected:
    AddressReplacerID replacer_;
};

TEST_F(ReplacerAddress, KeysBeginWithTheirPrefix) {
    EXPECT_EQ(replacer_.getPrefix(), "tempNode");
}

TEST_F(ReplacerAddress, AddressesAreWrittenInDecimal) {
    EXPECT_EQ(replacer_.toString(0), "0");
    EXPECT_EQ(replacer_.toString(247), "247");
    EXPECT_EQ(replacer_.toString(-5), "-5");
    EXPECT_EQ(replacer_.toString(std::numeric_limits<int>::min()), "-2147483648");
}

TEST_F(ReplacerAddress, TextsAreReadWithAutomaticBase) {
    const std::pair<const char*, int> rows[] = {
        {"12", 12},
        {"0x1F", 31},
        {"0X1f", 31},
        {"017", 15},
        {"0", 0},
        {"-3", -3},
        {"+7", 7},
        {" 9", 9},
        {"7abc", 7},
        {"", 0},
        {"nothing", 0},
        {"0x", 0},
        {"08", 0},
        {"99999999999", 2147483647},
        {"-99999999999", -2147483647 - 1},
    };
    for (const auto& [text, value] : rows)
        EXPECT_EQ(replacer_.fromString(text), value) << text;
}

TEST_F(ReplacerAddress, UnlistedAddressesStandForThemselves) {
    EXPECT_EQ(replacer_.replacementOf(5), 5);
    replacer_.setValue(5, 9, nullptr);
    EXPECT_EQ(replacer_.replacementOf(5), 9);
    EXPECT_EQ(replacer_.replacementOf(9), 9);
    EXPECT_EQ(replacer_.replacementOf(6), 6);
}

TEST_F(ReplacerAddress, OverrideIsRecordedAndPersisted) {
    replacer_.setValue(12, 7, "MRTU");
    EXPECT_EQ(replacer_.replacements(), (Pairs{{12, 7}}));
    EXPECT_EQ(storage_.calls(), std::vector<std::string>{"writeString(MRTU, tempNode12, 7)"});
    EXPECT_EQ(stored("tempNode12"), "text:7");
}

TEST_F(ReplacerAddress, PairsStandInOrderOfInsertionOneForEachAddress) {
    replacer_.setValue(9, 1, "MRTU");
    replacer_.setValue(3, 2, "MRTU");
    replacer_.setValue(9, 4, "MRTU");
    replacer_.setValue(1, 9, "MRTU");
    EXPECT_EQ(replacer_.replacements(), (Pairs{{9, 4}, {3, 2}, {1, 9}}));
    EXPECT_EQ(stored("tempNode9"), "text:4");
}

TEST_F(ReplacerAddress, ReplacingAnAddressByItselfRemovesTheKeyAndKeepsThePair) {
    replacer_.setValue(7, 9, "MRTU");
    ASSERT_EQ(stored("tempNode7"), "text:9");
    replacer_.setValue(7, 7, "MRTU");
    EXPECT_EQ(stored("tempNode7"), "none");
    EXPECT_EQ(replacer_.replacements(), (Pairs{{7, 7}}));
    EXPECT_EQ(storage_.count("removeKey"), 1);
}

TEST_F(ReplacerAddress, ReplacingANewAddressByItselfIsListedToo) {
    replacer_.setValue(5, 5, "MRTU");
    EXPECT_EQ(replacer_.replacements(), (Pairs{{5, 5}}));
    EXPECT_EQ(storage_.calls(), std::vector<std::string>{"removeKey(MRTU, tempNode5)"});
}

TEST_F(ReplacerAddress, WithoutSectionTheOverrideLivesInMemoryOnly) {
    replacer_.setValue(5, 9, nullptr);
    replacer_.setValue(6, 6, nullptr);
    EXPECT_EQ(replacer_.replacements(), (Pairs{{5, 9}, {6, 6}}));
    EXPECT_TRUE(storage_.calls().empty());
}

TEST_F(ReplacerAddress, WithoutStorageTheOverrideLivesInMemoryOnly) {
    useNoStorage();
    replacer_.setValue(5, 9, "MRTU");
    replacer_.setValue(6, 6, "MRTU");
    replacer_.restore("MRTU");
    EXPECT_EQ(replacer_.replacements(), (Pairs{{5, 9}, {6, 6}}));
}

}  // namespace
