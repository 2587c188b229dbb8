#include "settings/NumberText.h"

#include <gtest/gtest.h>

namespace settings {
namespace {

TEST(NumberTextTest, IsReadWithTheBaseOfItsPrefix) {
    struct Case {
        const char* text;
        long value;
        bool octal;
        bool partial;
    };
    const Case cases[] = {
        {"0", 0, false, false},
        {"10", 10, false, false},
        {"-1", -1, false, false},
        {"0x10", 16, false, false},
        {"010", 8, true, false},
        {"-010", -8, true, false},
        {"08", 0, true, true},
        {"0b1", 0, false, true},
        {"0x", 0, false, true},
        {" 010", 8, false, false},
        {"12abc", 12, false, true},
        {"abc", 0, false, true},
        {"", 0, false, true},
        {"00", 0, true, false},
        {"99999999999", 2147483647, false, false},
        {"-99999999999", -2147483647L - 1, false, false},
    };
    for (const Case& each : cases) {
        const NumberReading number = readNumber(each.text);
        EXPECT_EQ(each.value, number.value) << each.text;
        EXPECT_EQ(each.octal, number.octal) << each.text;
        EXPECT_EQ(each.partial, number.partial) << each.text;
    }
}

TEST(NumberTextTest, LosesItsLeadingZeroes) {
    EXPECT_EQ("100", withoutLeadingZeroes("0100"));
    EXPECT_EQ("0", withoutLeadingZeroes("00"));
    EXPECT_EQ("7", withoutLeadingZeroes("7"));
    EXPECT_EQ("0.5", withoutLeadingZeroes("0.5"));
}

}  // namespace
}  // namespace settings
