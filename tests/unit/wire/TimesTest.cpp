// Golden values: Modbus over Serial Line V1.02, 2.5.1.1.
#include "wire/Times.h"

#include <gtest/gtest.h>

namespace {

using std::chrono::hours;
using std::chrono::microseconds;
using std::chrono::nanoseconds;
using wire::LineRate;

constexpr std::uint64_t kMost = std::numeric_limits<std::uint64_t>::max();

TEST(TimesTest, ACharacterHasElevenBitsInRtuAndTenInAscii) {
    EXPECT_EQ(11, wire::standardCharacterBits(wire::Mode::Rtu));
    EXPECT_EQ(10, wire::standardCharacterBits(wire::Mode::Ascii));
    EXPECT_EQ(11, LineRate{9600}.characterBits);
}

TEST(TimesTest, CharactersTakeTheirBits) {
    EXPECT_EQ(nanoseconds(0), wire::timeOfCharacters(0, {9600}));
    EXPECT_EQ(nanoseconds(1'145'834), wire::timeOfCharacters(1, {9600}));
    EXPECT_EQ(nanoseconds(1'041'667), wire::timeOfCharacters(1, {9600, 10}));
    EXPECT_EQ(nanoseconds(9'166'667), wire::timeOfCharacters(8, {9600}));
    EXPECT_EQ(nanoseconds(95'487), wire::timeOfCharacters(1, {115200}));
    EXPECT_EQ(microseconds(55'000), wire::timeOfCharacters(5, {1000}));
}

TEST(TimesTest, ManyCharactersAreNotTheRoundedOneSeveralTimes) {
    EXPECT_EQ(std::chrono::seconds(11), wire::timeOfCharacters(9600, {9600}));
    EXPECT_EQ(nanoseconds(293'333'334), wire::timeOfCharacters(256, {9600}));
}

TEST(TimesTest, FramesAreThreeAndAHalfCharactersApart) {
    EXPECT_EQ(nanoseconds(32'083'334), wire::silenceBetweenFrames({1200}));
    EXPECT_EQ(nanoseconds(4'010'417), wire::silenceBetweenFrames({9600}));
    EXPECT_EQ(nanoseconds(3'645'834), wire::silenceBetweenFrames({9600, 10}));
    EXPECT_EQ(nanoseconds(2'005'209), wire::silenceBetweenFrames({19200}));
}

TEST(TimesTest, WithinAFrameThePauseIsOneAndAHalfCharacters) {
    EXPECT_EQ(nanoseconds(1'718'750), wire::longestPauseInFrame({9600}));
    EXPECT_EQ(nanoseconds(859'375), wire::longestPauseInFrame({19200}));
}

TEST(TimesTest, AboveNineteenTwoTheSilencesAreFixed) {
    for (const int baud : {19201, 38400, 57600, 115200, 4'000'000}) {
        EXPECT_EQ(microseconds(1750), wire::silenceBetweenFrames({baud})) << baud;
        EXPECT_EQ(microseconds(750), wire::longestPauseInFrame({baud})) << baud;
        EXPECT_EQ(microseconds(1750), wire::silenceBetweenFrames({baud, 10})) << baud;
    }
}

TEST(TimesTest, NoTimeIsTooShortByRounding) {
    for (int baud = 1; baud <= 19200; ++baud) {
        const std::int64_t silence = wire::silenceBetweenFrames({baud}).count();
        EXPECT_LE(std::int64_t{77} * 500'000'000, silence * baud) << baud;
        EXPECT_GT(std::int64_t{77} * 500'000'000, (silence - 1) * baud) << baud;
    }
}

TEST(TimesTest, NoTimeOverflows) {
    EXPECT_EQ(hours(11), wire::timeOfCharacters(3600, {1}));
    EXPECT_EQ(nanoseconds::max(), wire::timeOfCharacters(kMost, {9600}));
    EXPECT_EQ(nanoseconds::max(), wire::timeOfCharacters(kMost / 2, {1}));
    EXPECT_EQ(nanoseconds::max(), wire::timeOfCharacters(kMost / 64, {300}));
    const int fastest = std::numeric_limits<int>::max();
    EXPECT_EQ(nanoseconds(6), wire::timeOfCharacters(1, {fastest}));
    EXPECT_EQ(nanoseconds(11'000'000'006), wire::timeOfCharacters(fastest, {fastest - 1}));
}

TEST(TimesTest, ALineWithoutARateTakesNoTime) {
    EXPECT_EQ(nanoseconds(0), wire::timeOfCharacters(100, {0}));
    EXPECT_EQ(nanoseconds(0), wire::silenceBetweenFrames({-9600}));
    EXPECT_EQ(nanoseconds(0), wire::longestPauseInFrame({9600, 0}));
}

}  // namespace
