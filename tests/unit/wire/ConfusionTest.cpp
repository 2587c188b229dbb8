#include <gtest/gtest.h>

#include "tests/unit/wire/Exchanges.h"

namespace wire {
namespace {

bool confusable(const Bytes& one, const Bytes& other) {
    const bool result = confusable(requestOf(Mode::Rtu, one), requestOf(Mode::Rtu, other));
    EXPECT_EQ(result, confusable(requestOf(Mode::Rtu, other), requestOf(Mode::Rtu, one)));
    EXPECT_EQ(result, confusable(requestOf(Mode::Ascii, one), requestOf(Mode::Ascii, other)));
    return result;
}

TEST(ConfusionTest, ReadsOfTheSameLengthAtOnePlaceOrAnotherCanBeConfused) {
    for (const std::uint8_t function : Bytes{1, 2, 3, 4}) {
        const Bytes read{1, function, 0, 0, 0, 9};
        EXPECT_TRUE(confusable(read, read)) << +function;
        EXPECT_TRUE(confusable(read, with(read, 3, 77))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 0, 2))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 1, 5))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 5, 7))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 1, function % 4 + 1))) << +function;
    }
}

TEST(ConfusionTest, BitsThatFillTheSameBytesCanBeConfused) {
    EXPECT_TRUE(confusable({1, 1, 0, 0, 0, 9}, {1, 1, 0, 0, 0, 16}));
    EXPECT_FALSE(confusable({1, 1, 0, 0, 0, 9}, {1, 1, 0, 0, 0, 8}));
    EXPECT_FALSE(confusable({1, 2, 0, 0, 0, 16}, {1, 2, 0, 0, 0, 17}));
}

TEST(ConfusionTest, ALongRegisterCanBeConfusedWithTwoShortOnes) {
    EXPECT_TRUE(confusable({1, 3, 0, 0, 0, 2}, {1, 3, 0x13, 0x88, 0, 1}));
    EXPECT_TRUE(confusable({1, 3, 0, 0, 0, 6}, {1, 3, 0x13, 0x88, 0, 3}));
    EXPECT_FALSE(confusable({1, 3, 0, 0, 0, 2}, {1, 3, 0, 0, 0, 3}));
    EXPECT_FALSE(confusable({1, 4, 0, 0, 0, 2}, {1, 4, 0, 0, 0, 1}));
}

TEST(ConfusionTest, ReadsThatCanBeConfusedShareEveryGoodReply) {
    const auto couldAnswer = [](std::size_t count, std::size_t values) {
        return values == 2 * count || values == 4 * count;
    };
    for (std::uint8_t one = 1; one <= 62; ++one) {
        for (std::uint8_t other = 1; other <= 62; ++other) {
            bool shared = false;
            for (std::size_t values = 2; values <= 250; ++values)
                shared |= couldAnswer(one, values) && couldAnswer(other, values);
            if (shared) {
                EXPECT_TRUE(confusable({1, 3, 0, 0, 0, one}, {1, 3, 0, 9, 0, other}))
                    << +one << ' ' << +other;
            }
        }
    }
}

TEST(ConfusionTest, WritesCanBeConfusedWhenTheSameComesBack) {
    const Bytes coil{1, 5, 0, 4, 0xFF, 0};
    EXPECT_TRUE(confusable(coil, coil));
    EXPECT_FALSE(confusable(coil, with(coil, 3, 5)));
    EXPECT_FALSE(confusable(coil, with(coil, 4, 0)));
    const Bytes word{1, 6, 0, 4, 1, 2};
    EXPECT_TRUE(confusable(word, word));
    EXPECT_FALSE(confusable(word, with(word, 5, 3)));
    EXPECT_FALSE(confusable(word, with(word, 0, 2)));
    const Bytes words{1, 16, 0, 4, 0, 1, 2, 7, 7};
    EXPECT_TRUE(confusable(words, with(words, 8, 8)));  // Values do not come back.
    EXPECT_FALSE(confusable(words, with(words, 3, 5)));
    EXPECT_FALSE(confusable(words, {1, 16, 0, 4, 0, 2, 4, 0, 0, 0, 0}));
    EXPECT_TRUE(confusable({1, 15, 0, 4, 0, 9, 2, 1, 1}, {1, 15, 0, 4, 0, 9, 2, 0, 0}));
    EXPECT_FALSE(confusable({1, 15, 0, 4, 0, 9, 2, 1, 1}, {1, 15, 0, 4, 0, 10, 2, 1, 1}));
}

// A master may look at no more of the value than two bytes.
TEST(ConfusionTest, WritesOfLongRegistersCanBeConfusedByTheirFirstTwoBytes) {
    const Bytes write{1, 6, 0x13, 0x88, 0, 1, 0, 0};
    EXPECT_TRUE(confusable(write, with(write, 7, 1)));
    EXPECT_FALSE(confusable(write, with(write, 5, 2)));
    EXPECT_TRUE(confusable(write, {1, 6, 0x13, 0x88, 0, 1}));
}

TEST(ConfusionTest, RequestsOfAnotherFunctionCanBeConfusedAsOneNodes) {
    const Bytes request{1, 43, 14, 1, 0};
    EXPECT_TRUE(confusable(request, Bytes{1, 43, 14, 2, 0}));
    EXPECT_FALSE(confusable(request, Bytes{2, 43, 14, 1, 0}));
    EXPECT_FALSE(confusable(request, Bytes{1, 44, 14, 1, 0}));
}

TEST(ConfusionTest, FramingsAreNotConfused) {
    EXPECT_FALSE(confusable(requestOf(Mode::Rtu, kRead), requestOf(Mode::Ascii, kRead)));
}

}  // namespace
}  // namespace wire
