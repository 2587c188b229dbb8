#include "sim/TextNumbers.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace sim {
namespace {

using namespace std::chrono_literals;

TEST(TextNumbersTest, TimesMayHaveThreeDigitsBehindThePoint) {
    struct Row {
        const char* text;
        Nanos unit;
        Nanos expected;
    };
    for (const Row& row : {
             Row{"0", 1ms, 0ns},
             Row{"20", 1ms, 20ms},
             Row{"1.75", 1ms, 1750us},
             Row{"0.001", 1ms, 1us},
             Row{"007.500", 1s, 7500ms},
             Row{"3600", 1s, 1h},
         }) {
        Nanos time{-1};
        EXPECT_TRUE(readTime(row.text, row.unit, time)) << row.text;
        EXPECT_EQ(row.expected, time) << row.text;
    }
}

TEST(TextNumbersTest, OtherTextsAndLongerTimesAreRefusedAndStoreNothing) {
    for (const char* const text :
         {"", ".", "1.", ".5", "1.2345", "-1", "+1", "1e3", "1,5", " 1", "1 ", "1.-5", "3600.001",
          "99999999999999999999", "9999999999999999999999.5"}) {
        Nanos time = 42ns;
        EXPECT_FALSE(readTime(text, 1s, time)) << text;
        EXPECT_EQ(42ns, time) << text;
    }
}

TEST(TextNumbersTest, NumbersAreDecimalAndInRange) {
    std::uint8_t number = 42;
    EXPECT_TRUE(readNumber<std::uint8_t>("255", 1, 255, number));
    EXPECT_EQ(255, number);
    for (const char* const text : {"", "0", "256", "1000", "-1", "1 ", "0x1", "x"})
        EXPECT_FALSE(readNumber<std::uint8_t>(text, 1, 255, number)) << text;
    EXPECT_EQ(255, number);
}

}  // namespace
}  // namespace sim
