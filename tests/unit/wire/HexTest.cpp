#include "wire/Hex.h"

#include <gtest/gtest.h>

#include <array>

namespace wire {
namespace {

Bytes characters(std::string_view text) {
    return {text.begin(), text.end()};
}

TEST(HexTest, DigitsAreUpperCaseAndTheHighOneComesFirst) {
    Bytes out = characters(":");
    putHex(out, 0x0A);
    putHex(out, 0xF1);
    EXPECT_EQ(characters(":0AF1"), out);
}

TEST(HexTest, OnlyUpperCaseDigitsHaveAValue) {
    EXPECT_EQ(0, hexValue('0'));
    EXPECT_EQ(15, hexValue('F'));
    for (const char other : {'a', 'G', ' ', '\0'})
        EXPECT_FALSE(hexValue(static_cast<std::uint8_t>(other))) << other;
}

TEST(HexTest, BytesAreReadFromPairsOfDigits) {
    EXPECT_EQ((Bytes{0x01, 0xFF}), fromHex(characters("01FF")));
    EXPECT_EQ(Bytes{}, fromHex({}));
    EXPECT_FALSE(fromHex(characters("01F")));
    EXPECT_FALSE(fromHex(characters("01fF")));
}

TEST(HexTest, BytesGoIntoTheRoomThatThereIs) {
    std::array<std::uint8_t, 2> room{};
    EXPECT_EQ(2U, bytesInHex(characters("01FF"), room));
    EXPECT_EQ(0xFF, room[1]);
    EXPECT_EQ(0U, bytesInHex({}, {}));
    EXPECT_FALSE(bytesInHex(characters("01FF02"), room));
    EXPECT_FALSE(bytesInHex(characters("0G"), room));
}

TEST(HexTest, TextHasABlankBetweenBytesOrWhatIsAskedFor) {
    EXPECT_EQ("01 0A FF", hexText(Bytes{0x01, 0x0A, 0xFF}));
    EXPECT_EQ("010AFF", hexText(Bytes{0x01, 0x0A, 0xFF}, ""));
    EXPECT_EQ("", hexText({}));
}

}  // namespace
}  // namespace wire
