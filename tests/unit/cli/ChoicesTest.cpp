#include "cli/Choices.h"

#include <gtest/gtest.h>

namespace {

const std::vector<std::string> kParities{"none", "even", "odd", "mark"};

TEST(ChoicesTest, TheNearestNameIsOffered) {
    EXPECT_EQ("; did you mean 'even'?", cli::didYouMean("evn", kParities));
    EXPECT_EQ("", cli::didYouMean("something else", kParities));
    EXPECT_EQ("; did you mean '9600'?", cli::didYouMean("9601", {"9600", "19200"}));
    EXPECT_EQ("", cli::didYouMean("14400", {"1200", "19200"}));
    EXPECT_EQ("", cli::didYouMean("0", {"150", "300"}));
    EXPECT_EQ("'evn' is not one of none, even, odd, mark; did you mean 'even'?",
              cli::notOneOf("evn", kParities));
    EXPECT_EQ("'' is not one of none, even, odd, mark", cli::notOneOf("", kParities));
}

TEST(ChoicesTest, ANumberIsDigitsAlone) {
    EXPECT_EQ(0, cli::plainNumber("0", 9));
    EXPECT_EQ(9, cli::plainNumber("9", 9));
    EXPECT_EQ(8, cli::plainNumber("008", 9));
    for (const char* const text :
         {"", "10", "-1", "+1", "0x1", "1 ", " 1", "1a", "99999999999999999999"})
        EXPECT_EQ(-1, cli::plainNumber(text, 9)) << text;
}

TEST(ChoicesTest, CaseDoesNotCountInWords) {
    EXPECT_TRUE(cli::sameWord("EVEN", "even"));
    EXPECT_FALSE(cli::sameWord("eve", "even"));
    EXPECT_TRUE(cli::sameWord("", ""));
}

}  // namespace
