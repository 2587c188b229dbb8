// Replaced node addresses and their way into the storage.
#include <limits>
#include <string>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using Pairs = std::vector<std::pair<int, int>>;

class ReplacerAddressTest : public ReplacerTest {
  protected:
    AddressReplacerID replacer_;
};

TEST_F(ReplacerAddressTest, KeysBeginWithTheirPrefix) {
    EXPECT_EQ("tempNode", replacer_.getPrefix());
}

TEST_F(ReplacerAddressTest, AddressesAreWrittenInDecimal) {
    EXPECT_EQ("0", replacer_.toString(0));
    EXPECT_EQ("247", replacer_.toString(247));
    EXPECT_EQ("-5", replacer_.toString(-5));
    EXPECT_EQ("-2147483648", replacer_.toString(std::numeric_limits<int>::min()));
}

TEST_F(ReplacerAddressTest, TextsAreReadWithAutomaticBase) {
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
        EXPECT_EQ(value, replacer_.fromString(text)) << text;
}

TEST_F(ReplacerAddressTest, UnlistedAddressesStandForThemselves) {
    EXPECT_EQ(5, replacer_.replacementOf(5));
    replacer_.setValue(5, 9, nullptr);
    EXPECT_EQ(9, replacer_.replacementOf(5));
    EXPECT_EQ(9, replacer_.replacementOf(9));
    EXPECT_EQ(6, replacer_.replacementOf(6));
}

TEST_F(ReplacerAddressTest, OverrideIsRecordedAndPersisted) {
    replacer_.setValue(12, 7, "MRTU");
    EXPECT_EQ((Pairs{{12, 7}}), replacer_.replacements());
    EXPECT_EQ(std::vector<std::string>{"writeString(MRTU, tempNode12, 7)"}, storage_.calls());
    EXPECT_EQ("text:7", stored("tempNode12"));
}

TEST_F(ReplacerAddressTest, PairsStandInOrderOfInsertionOneForEachAddress) {
    replacer_.setValue(9, 1, "MRTU");
    replacer_.setValue(3, 2, "MRTU");
    replacer_.setValue(9, 4, "MRTU");
    replacer_.setValue(1, 9, "MRTU");
    EXPECT_EQ((Pairs{{9, 4}, {3, 2}, {1, 9}}), replacer_.replacements());
    EXPECT_EQ("text:4", stored("tempNode9"));
}

TEST_F(ReplacerAddressTest, ReplacingAnAddressByItselfRemovesTheKeyAndKeepsThePair) {
    replacer_.setValue(7, 9, "MRTU");
    ASSERT_EQ("text:9", stored("tempNode7"));
    replacer_.setValue(7, 7, "MRTU");
    EXPECT_EQ("none", stored("tempNode7"));
    EXPECT_EQ((Pairs{{7, 7}}), replacer_.replacements());
    EXPECT_EQ(1, storage_.count("removeKey"));
}

TEST_F(ReplacerAddressTest, ReplacingANewAddressByItselfIsListedToo) {
    replacer_.setValue(5, 5, "MRTU");
    EXPECT_EQ((Pairs{{5, 5}}), replacer_.replacements());
    EXPECT_EQ(std::vector<std::string>{"removeKey(MRTU, tempNode5)"}, storage_.calls());
}

TEST_F(ReplacerAddressTest, WithoutSectionTheOverrideLivesInMemoryOnly) {
    replacer_.setValue(5, 9, nullptr);
    replacer_.setValue(6, 6, nullptr);
    EXPECT_EQ((Pairs{{5, 9}, {6, 6}}), replacer_.replacements());
    EXPECT_TRUE(storage_.calls().empty());
}

TEST_F(ReplacerAddressTest, WithoutStorageTheOverrideLivesInMemoryOnly) {
    useNoStorage();
    replacer_.setValue(5, 9, "MRTU");
    replacer_.setValue(6, 6, "MRTU");
    replacer_.restore("MRTU");
    EXPECT_EQ((Pairs{{5, 9}, {6, 6}}), replacer_.replacements());
}

}  // namespace
