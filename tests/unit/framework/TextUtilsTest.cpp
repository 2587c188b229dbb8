#include "framework/TextUtils.h"

#include <gtest/gtest.h>

#include <cctype>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

namespace {

using Pieces = std::vector<std::string>;

TEST(TextUtilsTest, TrimRemovesBlanksAndTabsFromBothEndsOnly) {
    const std::vector<std::pair<std::string, std::string>> rows = {
        {"", ""},
        {" ", ""},
        {"\t \t", ""},
        {"a", "a"},
        {"  a", "a"},
        {"a\t", "a"},
        {" \ta b\tc \t", "a b\tc"},
        {"\n a \n", "\n a \n"},
        {" \r\n ", "\r\n"},
        {"\va\f", "\va\f"},
    };
    for (const auto& [text, expected] : rows) {
        std::string trimmed = text;
        ProtUtilsN::Trim(trimmed);
        EXPECT_EQ(expected, trimmed) << '"' << text << '"';
        EXPECT_EQ(expected, ProtUtilsN::GetTrim(text)) << '"' << text << '"';
    }
}

TEST(TextUtilsTest, TrimKeepsZeroBytes) {
    const std::string text(" a\0b ", 5);
    EXPECT_EQ(std::string("a\0b", 3), ProtUtilsN::GetTrim(text));
}

TEST(TextUtilsTest, ParseSubstringsSplitsTrimsAndKeepsEmptyPieces) {
    const std::vector<std::pair<std::string, Pieces>> rows = {
        {"", {""}},
        {"a", {"a"}},
        {",", {"", ""}},
        {"a,b", {"a", "b"}},
        {" a , b\t,c d", {"a", "b", "c d"}},
        {",a,,b,", {"", "a", "", "b", ""}},
        {" , ", {"", ""}},
    };
    for (const auto& [text, expected] : rows) {
        Pieces pieces;
        ProtUtilsN::ParseSubstrings(text, pieces, ',');
        EXPECT_EQ(expected, pieces) << '"' << text << '"';
    }
}

TEST(TextUtilsTest, ParseSubstringsAppendsToWhatIsThere) {
    Pieces pieces = {"first"};
    ProtUtilsN::ParseSubstrings("1?HREG?4.0?int", pieces, '?');
    EXPECT_EQ((Pieces{"first", "1", "HREG", "4.0", "int"}), pieces);
}

TEST(TextUtilsTest, ParseSubstringsTakesABlankAsDelimiter) {
    Pieces pieces;
    ProtUtilsN::ParseSubstrings("a b", pieces, ' ');
    EXPECT_EQ((Pieces{"a", "b"}), pieces);
}

TEST(TextUtilsTest, GetConfigValueTakesTheLettersAndDigitsBehindTheFirstKey) {
    struct Row {
        const char* text;
        const char* key;
        const char* value;
    };
    const Row rows[] = {
        {"baud=9600", "baud", "9600"},
        {"xbaud=1 baud=2", "baud", "1"},
        {"id=aB9-c", "id", "aB9"},
        {"id= 7", "id", ""},
        {"id=", "id", ""},
        {"a=1,b=2;", "b", "2"},
        {"id=1 id=2", "id", "1"},
        {"id id=4", "id", "4"},
        {"id=x\xC3\xA4y", "id", "x"},
    };
    for (const Row& row : rows) {
        std::string value = "before";
        EXPECT_TRUE(ProtUtilsN::GetConfigValue(row.text, row.key, value)) << row.text;
        EXPECT_EQ(row.value, value) << row.text;
    }
}

TEST(TextUtilsTest, GetConfigValueLeavesTheValueWhenTheKeyIsMissing) {
    for (const char* text : {"", "baud", "baud 9600", "Baud=9600", "bau=9600"}) {
        std::string value = "before";
        EXPECT_FALSE(ProtUtilsN::GetConfigValue(text, "baud", value)) << text;
        EXPECT_EQ("before", value) << text;
    }
}

struct NumberRow {
    const char* text;
    std::int32_t value;
};

TEST(TextUtilsTest, ParseIntegerTakesTheBaseFromThePrefix) {
    const NumberRow rows[] = {
        {"0", 0},     {"16", 16}, {"0x10", 16},   {"0X1f", 31}, {"010", 8},    {"12abc", 12},
        {"abc", 0},   {"", 0},    {"  \t42", 42}, {"-5", -5},   {"+5", 5},     {"-0x10", -16},
        {"-010", -8}, {"089", 0}, {"0x", 0},      {"0xg", 0},   {"0b11", 0},   {"1 2", 1},
        {"- 5", 0},   {"--5", 0}, {"7.9", 7},     {"1e3", 1},   {" 0x0F", 15}, {"0778", 63},
    };
    for (const NumberRow& row : rows) {
        EXPECT_EQ(row.value, ProtUtilsN::parseInteger(row.text)) << '"' << row.text << '"';
    }
}

TEST(TextUtilsTest, ParseIntegerKeepsToThirtyTwoBits) {
    const NumberRow rows[] = {
        {"2147483647", INT32_MAX},
        {"2147483648", INT32_MAX},
        {"4294967297", INT32_MAX},
        {"0xFFFFFFFF", INT32_MAX},
        {"99999999999999999999999999", INT32_MAX},
        {"-2147483648", INT32_MIN},
        {"-2147483649", INT32_MIN},
        {"-99999999999999999999999999", INT32_MIN},
    };
    for (const NumberRow& row : rows) {
        EXPECT_EQ(row.value, ProtUtilsN::parseInteger(row.text)) << row.text;
    }
}

TEST(TextUtilsTest, ParseDecimalIgnoresPrefixes) {
    const NumberRow rows[] = {
        {"10", 10},
        {"010", 10},
        {"0x10", 0},
        {" -3x", -3},
        {"", 0},
        {"+08", 8},
        {"x", 0},
        {"4294967297", INT32_MAX},
        {"-99999999999", INT32_MIN},
    };
    for (const NumberRow& row : rows) {
        EXPECT_EQ(row.value, ProtUtilsN::parseDecimal(row.text)) << '"' << row.text << '"';
    }
}

TEST(TextUtilsTest, CharacterClassesAreThoseOfTheStandardLocale) {
    for (int code = 0; code < 256; ++code) {
        const char c = static_cast<char>(code);
        EXPECT_EQ(std::isspace(code) != 0, ProtUtilsN::isWhiteSpace(c)) << code;
        EXPECT_EQ(std::isdigit(code) != 0, ProtUtilsN::isDecimalDigit(c)) << code;
    }
}

// What is behind the first `size` bytes must never be touched, hence the '#' in every buffer.
std::string CopiedInto(const char* text, int size) {
    std::string out(8, '#');
    ProtUtilsN::copyBounded(out.data(), text, size);
    return out;
}

TEST(TextUtilsTest, CopyBoundedPadsWithZeroes) {
    EXPECT_EQ(CopiedInto("ab", 5), std::string("ab\0\0\0###", 8));
    EXPECT_EQ(CopiedInto("", 2), std::string("\0\0######", 8));
}

TEST(TextUtilsTest, CopyBoundedLeavesOutTheEndWhenItDoesNotFit) {
    EXPECT_EQ(CopiedInto("abcde", 3), "abc#####");
    EXPECT_EQ(CopiedInto("abc", 3), "abc#####");
}

TEST(TextUtilsTest, CopyBoundedWritesNothingWithoutRoom) {
    for (const int size : {0, -1, INT32_MIN}) {
        EXPECT_EQ("########", CopiedInto("abc", size)) << size;
    }
}

TEST(TextUtilsTest, ItoaWritesDigitsAndReturnsTheBuffer) {
    struct Row {
        int value;
        int base;
        const char* text;
    };
    const Row rows[] = {
        {0, 10, "0"},
        {7, 10, "7"},
        {10, 10, "10"},
        {INT32_MAX, 10, "2147483647"},
        {0, 16, "0"},
        {9, 16, "9"},
        {10, 16, "a"},
        {0xdeadbe, 16, "deadbe"},
        {INT32_MAX, 16, "7fffffff"},
        {5, 2, "101"},
        {8, 8, "10"},
        {15, 12, "13"},
        {11, 12, ";"},
    };
    for (const Row& row : rows) {
        char buffer[40];
        std::memset(buffer, '#', sizeof buffer);
        EXPECT_EQ(buffer, itoa(row.value, buffer, row.base));
        EXPECT_STREQ(row.text, buffer) << row.value << " in base " << row.base;
        EXPECT_EQ('#', buffer[std::strlen(row.text) + 1]) << row.value;
    }
}

}  // namespace
