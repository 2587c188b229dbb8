#include "runtime/StoredValue.h"

#include <gtest/gtest.h>

#include <climits>

namespace {

using namespace runtime;

struct TextRow {
    const char* text;
    int number;
    bool flag;
};

TEST(StoredValue, TextReadsAsNumberTheWayStrtolDoes) {
    constexpr TextRow kRows[] = {
        {"12", 12, true},
        {"-7", -7, true},
        {"0x1F", 31, true},
        {"017", 15, true},
        {" 9 lives", 9, true},
        {"+4", 4, true},
        {"", 0, false},
        {"none", 0, false},
        {"0", 0, false},
        {"0x", 0, false},
        {"true", 0, true},
        {"false", 0, false},
        {"99999999999", INT_MAX, true},
        {"-99999999999", INT_MIN, true},
        {"99999999999999999999999", INT_MAX, true},
        {"08", 0, false},
    };
    for (const TextRow& row : kRows) {
        EXPECT_EQ(storedInt(std::string(row.text)), row.number) << '"' << row.text << '"';
        EXPECT_EQ(storedBool(std::string(row.text)), row.flag) << '"' << row.text << '"';
        EXPECT_EQ(storedText(std::string(row.text)), row.text);
    }
}

TEST(StoredValue, NumbersAndBooleansReadAsEachOther) {
    EXPECT_EQ(storedText(-42), "-42");
    EXPECT_EQ(storedText(INT_MIN), "-2147483648");
    EXPECT_EQ(storedText(true), "1");
    EXPECT_EQ(storedText(false), "0");
    EXPECT_EQ(storedInt(true), 1);
    EXPECT_EQ(storedInt(false), 0);
    EXPECT_TRUE(storedBool(-1));
    EXPECT_FALSE(storedBool(0));
}

TEST(StoredValue, TypesHaveNames) {
    EXPECT_STREQ(storedTypeName(std::string("x")), "text");
    EXPECT_STREQ(storedTypeName(true), "bool");
    EXPECT_STREQ(storedTypeName(1), "int");
}

}  // namespace
