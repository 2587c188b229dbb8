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

TEST(StoredValueTest, TextReadsAsNumberTheWayStrtolDoes) {
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
        EXPECT_EQ(row.number, storedInt(std::string(row.text))) << '"' << row.text << '"';
        EXPECT_EQ(row.flag, storedBool(std::string(row.text))) << '"' << row.text << '"';
        EXPECT_EQ(row.text, storedText(std::string(row.text)));
    }
}

TEST(StoredValueTest, NumbersAndBooleansReadAsEachOther) {
    EXPECT_EQ("-42", storedText(-42));
    EXPECT_EQ("-2147483648", storedText(INT_MIN));
    EXPECT_EQ("1", storedText(true));
    EXPECT_EQ("0", storedText(false));
    EXPECT_EQ(1, storedInt(true));
    EXPECT_EQ(0, storedInt(false));
    EXPECT_TRUE(storedBool(-1));
    EXPECT_FALSE(storedBool(0));
}

TEST(StoredValueTest, TypesHaveNames) {
    EXPECT_STREQ("text", storedTypeName(std::string("x")));
    EXPECT_STREQ("bool", storedTypeName(true));
    EXPECT_STREQ("int", storedTypeName(1));
}

}  // namespace
