// ASCII frames, built and taken apart.
#include <gtest/gtest.h>

#include "mrtu/Frame.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;
using testing_support::characters;
using testing_support::hex;
using testing_support::toHex;

std::string textOf(const _MRTU::Frame& frame) {
    return {frame.bytes.begin(), frame.bytes.begin() + frame.length};
}

Bytes bytesOf(const _MRTU::AsciiBytes& decoded) {
    return {decoded.bytes.begin(), decoded.bytes.begin() + decoded.length};
}

bool isGood(const std::string& text) {
    const Bytes frame = characters(text);
    return _MRTU::isGoodAsciiFrame(_MRTU::decodeAscii(frame));
}

TEST(AsciiFrameTest, GoldenRequest) {
    const Bytes message = hex("01 03 00 00 00 0A");
    EXPECT_EQ(":01030000000AF2\r\n", textOf(_MRTU::frameAscii(message)));
}

TEST(AsciiFrameTest, DigitsAreUpperCaseAndHighNibbleFirst) {
    const Bytes message = hex("AF 10 9C");
    EXPECT_EQ(":AF109CA5\r\n", textOf(_MRTU::frameAscii(message)));
}

TEST(AsciiFrameTest, LongestMessageFillsAFrame) {
    const Bytes message(_MRTU::kMaxMessage, 0xA5);
    const std::string text = textOf(_MRTU::frameAscii(message));
    EXPECT_EQ(513U, text.size());
    EXPECT_EQ(testing_support::asciiFrame(message), characters(text));
}

TEST(AsciiFrameTest, DecodesPairsAndLeavesTheLineEndAlone) {
    const Bytes frame = characters(":010302ABCD82\r\n");
    const auto decoded = _MRTU::decodeAscii(frame);
    EXPECT_TRUE(decoded.wellFormed);
    EXPECT_EQ("01 03 02 AB CD 82", toHex(bytesOf(decoded)));
    EXPECT_TRUE(_MRTU::isGoodAsciiFrame(decoded));
}

TEST(AsciiFrameTest, LineEndIsNotLookedAt) {
    EXPECT_TRUE(isGood(":010302ABCD82??"));
    EXPECT_TRUE(isGood(":010302ABCD82\n\n"));
}

TEST(AsciiFrameTest, ReadsBackWhatItBuilt) {
    for (std::size_t length = 3; length <= _MRTU::kMaxMessage; length += 7) {
        Bytes message(length);
        for (std::size_t i = 0; i < length; ++i)
            message[i] = static_cast<std::uint8_t>(i * 29 + length);
        const std::string text = textOf(_MRTU::frameAscii(message));
        const Bytes frame = characters(text);
        const auto decoded = _MRTU::decodeAscii(frame);
        EXPECT_TRUE(_MRTU::isGoodAsciiFrame(decoded)) << text;
        EXPECT_EQ(toHex(message), toHex(testing_support::firstOf(bytesOf(decoded), length)));
    }
}

TEST(AsciiFrameTest, LowerCaseDigitsAreBad) {
    EXPECT_FALSE(isGood(":010302abcd82\r\n"));
    EXPECT_FALSE(isGood(":010302AbCD82\r\n"));
}

TEST(AsciiFrameTest, AnyOtherCharacterIsBad) {
    const std::string good = ":010302ABCD82\r\n";
    ASSERT_TRUE(isGood(good));
    for (int character = 0; character < 256; ++character) {
        const char digit = static_cast<char>(character);
        if ((digit >= '0' && digit <= '9') || (digit >= 'A' && digit <= 'F')) continue;
        for (std::size_t place = 1; place <= 12; ++place) {
            std::string bad = good;
            bad[place] = digit;
            EXPECT_FALSE(isGood(bad)) << "character " << character << " at " << place;
        }
    }
}

/// A character above "F" shifts the value of its pair; pairs are easily found whose garbage sums up
/// to a good check.
TEST(AsciiFrameTest, GarbageThatSumsUpIsStillBad) {
    EXPECT_FALSE(isGood(":010302AAGA99\r\n"));
}

TEST(AsciiFrameTest, ColonMustStandInFront) {
    EXPECT_FALSE(isGood(";010302ABCD82\r\n"));
    EXPECT_FALSE(isGood("0010302ABCD82\r\n"));
    EXPECT_FALSE(isGood(" :010302ABCD82\r\n"));
}

TEST(AsciiFrameTest, NeedsMoreThanEightCharacters) {
    EXPECT_FALSE(isGood(":01FF\r\n"));
    EXPECT_FALSE(isGood(":0100F\r\n")) << "eight";
    EXPECT_TRUE(isGood(":0102FD\r\n")) << "nine";
}

/// The pairs are counted from the length, rounded down, so the last character may be missing.
TEST(AsciiFrameTest, OnlyTheVeryLastCharacterMayBeMissing) {
    const std::string good = ":010302ABCD82\r\n";
    EXPECT_TRUE(isGood(good.substr(0, good.size() - 1)));
    for (std::size_t length = 0; length < good.size() - 1; ++length)
        EXPECT_FALSE(isGood(good.substr(0, length))) << length;
    EXPECT_FALSE(isGood(good + "\n")) << "the line end has become a pair";
}

TEST(AsciiFrameTest, WrongLrcIsBad) {
    EXPECT_FALSE(isGood(":010302ABCD83\r\n"));
    EXPECT_FALSE(isGood(":010302ABCC82\r\n"));
}

TEST(AsciiFrameTest, LongestReceptionIsDecodedWithinTheBuffer) {
    std::string text = ":";
    while (text.size() < 513)
        text += '0';
    const Bytes frame = characters(text);
    const auto decoded = _MRTU::decodeAscii(frame);
    EXPECT_LE(decoded.length, 256);
}

}  // namespace
