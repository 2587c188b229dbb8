#include "settings/NumberText.h"

#include <gtest/gtest.h>

namespace settings {
namespace {

TEST(NumberText, IsReadWithTheBaseOfItsPrefix) {
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
        EXPECT_EQ(number.value, each.value) << each.text;
        EXPECT_EQ(number.octal, each.octal) << each.text;
        EXPECT_EQ(number.partial, each.partial) << each.text;
    }
}

TEST(NumberText, LosesItsLeadingZeroes) {
    EXPECT_EQ(withoutLeadingZeroes("0100"), "100");
    EXPECT_EQ(withoutLeadingZeroes("00"), "0");
    EXPECT_EQ(withoutLeadingZeroes("7"), "7");
    EXPECT_EQ(withoutLeadingZeroes("0.5"), "0.5");
}

}  // namespace
}  // namespace settings
