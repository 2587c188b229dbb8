#include "wire/Framing.h"

#include <gtest/gtest.h>

#include <string>
#include <string_view>

namespace wire {
namespace {

Bytes bytesOf(std::string_view text) {
    return {text.begin(), text.end()};
}
std::string textOf(const Bytes& bytes) {
    return {bytes.begin(), bytes.end()};
}

const Bytes kReadRequest{0x11, 0x03, 0x00, 0x6B, 0x00, 0x03};
const Bytes kReadRequestRtu{0x11, 0x03, 0x00, 0x6B, 0x00, 0x03, 0x76, 0x87};
constexpr std::string_view kReadRequestAscii = ":1103006B00037E\r\n";

/// Requests of eight bytes, once the function is there.
std::optional<std::size_t> eightBytes(ByteView firstBytes) {
    return firstBytes.size() < 2 ? std::nullopt : std::optional<std::size_t>(8);
}

std::optional<std::size_t> unknownLength(ByteView) {
    return std::nullopt;
}

TEST(FramingTest, EncodedRtuCarriesTheLowByteOfTheCrcFirst) {
    EXPECT_EQ(kReadRequestRtu, encodeFrame(Mode::Rtu, kReadRequest));
}

TEST(FramingTest, EncodedAsciiCarriesUpperCaseDigitsAndCrLf) {
    EXPECT_EQ(kReadRequestAscii, textOf(encodeFrame(Mode::Ascii, kReadRequest)));
}

TEST(FramingTest, FramesOfTheLongestMessageHaveTheStandardsLengths) {
    EXPECT_EQ(256U, kMaxRtuFrame);
    EXPECT_EQ(513U, kMaxAsciiFrame);
    const Bytes message(kMaxMessage, 0x11);
    for (const Mode mode : {Mode::Rtu, Mode::Ascii}) {
        MessageRoom room{};
        const Bytes frame = encodeFrame(mode, message);
        EXPECT_EQ(frameLength(mode, message.size()), frame.size());
        EXPECT_EQ(message.size(), messageIn(mode, frame, room).size());
    }
}

TEST(FramingTest, EncodedBrokenCheckDiffersInAllItsBitsOnly) {
    const Bytes rtu{0x11, 0x03, 0x00, 0x6B, 0x00, 0x03, 0x89, 0x78};
    EXPECT_EQ(rtu, encodeFrame(Mode::Rtu, kReadRequest, true));
    EXPECT_EQ(":1103006B000381\r\n", textOf(encodeFrame(Mode::Ascii, kReadRequest, true)));
}

TEST(FramingTest, DecodedGoodFramesGiveTheMessage) {
    EXPECT_EQ(kReadRequest, decodeFrame(Mode::Rtu, kReadRequestRtu).message);
    EXPECT_EQ(kReadRequest, decodeFrame(Mode::Ascii, bytesOf(kReadRequestAscii)).message);
}

TEST(FramingTest, DecodedEveryTruncationIsDamagedAndKeepsItsBytes) {
    for (std::size_t length = 0; length < kReadRequestRtu.size(); ++length) {
        const auto frame = decodeFrame(Mode::Rtu, ByteView(kReadRequestRtu).first(length));
        EXPECT_TRUE(frame.damaged()) << length;
        EXPECT_EQ(length, frame.raw.size());
    }
    const Bytes ascii = bytesOf(kReadRequestAscii);
    for (std::size_t length = 0; length < ascii.size(); ++length) {
        EXPECT_TRUE(decodeFrame(Mode::Ascii, ByteView(ascii).first(length)).damaged()) << length;
    }
}

TEST(FramingTest, DecodedDamagedAsciiFrames) {
    for (const std::string_view text : {
             ":1103006B00037F\r\n",   // wrong LRC
             ":1103006b00037E\r\n",   // lower case
             ":1103006G00037E\r\n",   // no digit
             ":1103006B00037E0\r\n",  // odd number of digits
             ";1103006B00037E\r\n",   // no colon
             ":1103006B00037E\n\r",   // ends swapped
             ":11EF\r\n",             // no function
         }) {
        EXPECT_TRUE(decodeFrame(Mode::Ascii, bytesOf(text)).damaged()) << text;
    }
}

TEST(FramingTest, DecodedRtuFrameOf256BytesIsTheLongest) {
    EXPECT_FALSE(decodeFrame(Mode::Rtu, encodeFrame(Mode::Rtu, Bytes(254, 0x55))).damaged());
    EXPECT_TRUE(decodeFrame(Mode::Rtu, encodeFrame(Mode::Rtu, Bytes(255, 0x55))).damaged());
}

TEST(FramingTest, DecodedAsciiFrameOf254BytesIsTheLongest) {
    EXPECT_FALSE(decodeFrame(Mode::Ascii, encodeFrame(Mode::Ascii, Bytes(254, 0x55))).damaged());
    EXPECT_TRUE(decodeFrame(Mode::Ascii, encodeFrame(Mode::Ascii, Bytes(255, 0x55))).damaged());
}

TEST(FramingTest, RtuSplitterAnnouncedLengthEndsAFrameAtOnce) {
    FrameSplitter splitter(Mode::Rtu, eightBytes);
    const auto frames = splitter.add(kReadRequestRtu);
    ASSERT_EQ(1U, frames.size());
    EXPECT_EQ(kReadRequest, frames[0].message);
    EXPECT_FALSE(splitter.waitsForSilence());
}

TEST(FramingTest, RtuSplitterBytesMayArriveOneByOne) {
    FrameSplitter splitter(Mode::Rtu, eightBytes);
    for (std::size_t i = 0; i + 1 < kReadRequestRtu.size(); ++i) {
        EXPECT_TRUE(splitter.add(ByteView(kReadRequestRtu).subspan(i, 1)).empty()) << i;
    }
    EXPECT_EQ(1U, splitter.add(ByteView(kReadRequestRtu).last(1)).size());
}

TEST(FramingTest, RtuSplitterFramesMayFollowOneAnotherInOneRead) {
    FrameSplitter splitter(Mode::Rtu, eightBytes);
    Bytes twice = kReadRequestRtu;
    twice.insert(twice.end(), kReadRequestRtu.begin(), kReadRequestRtu.end());
    twice.push_back(0x11);
    EXPECT_EQ(2U, splitter.add(twice).size());
    EXPECT_TRUE(splitter.waitsForSilence());
}

TEST(FramingTest, RtuSplitterUnknownLengthEndsAtSilence) {
    FrameSplitter splitter(Mode::Rtu, unknownLength);
    EXPECT_TRUE(splitter.add(kReadRequestRtu).empty());
    const auto frame = splitter.silence();
    ASSERT_TRUE(frame);
    EXPECT_EQ(kReadRequest, frame->message);
    EXPECT_FALSE(splitter.silence());
}

TEST(FramingTest, RtuSplitterWrongCrcWaitsForSilenceAndTakesAllWithIt) {
    FrameSplitter splitter(Mode::Rtu, eightBytes);
    Bytes bad = kReadRequestRtu;
    bad[7] ^= 0x01;
    EXPECT_TRUE(splitter.add(bad).empty());
    EXPECT_TRUE(splitter.add(kReadRequestRtu).empty());
    const auto frame = splitter.silence();
    ASSERT_TRUE(frame);
    EXPECT_TRUE(frame->damaged());
    EXPECT_EQ(16U, frame->raw.size());
    EXPECT_EQ(1U, splitter.add(kReadRequestRtu).size());
}

TEST(FramingTest, RtuSplitterEndlessBytesStayBounded) {
    FrameSplitter splitter(Mode::Rtu, unknownLength);
    for (int i = 0; i < 100; ++i)
        EXPECT_TRUE(splitter.add(Bytes(1000, 0xAA)).empty());
    const auto frame = splitter.silence();
    ASSERT_TRUE(frame);
    EXPECT_TRUE(frame->damaged());
    EXPECT_EQ(kMaxRtuFrame + 1, frame->raw.size());
}

TEST(FramingTest, AsciiSplitterFrameBeginsAtTheLastColonAndEndsAtCrLf) {
    FrameSplitter splitter(Mode::Ascii, unknownLength);
    const auto frames = splitter.add(bytesOf("noise\r\n:1103:1103006B00037E\r\n:11"));
    ASSERT_EQ(1U, frames.size());
    EXPECT_EQ(kReadRequest, frames[0].message);
    EXPECT_EQ(kReadRequestAscii, textOf(frames[0].raw));
}

TEST(FramingTest, AsciiSplitterSilenceDoesNotEndAFrame) {
    FrameSplitter splitter(Mode::Ascii, unknownLength);
    EXPECT_TRUE(splitter.add(bytesOf(":1103006B0")).empty());
    EXPECT_FALSE(splitter.waitsForSilence());
    EXPECT_FALSE(splitter.silence());
    EXPECT_EQ(1U, splitter.add(bytesOf("0037E\r\n")).size());
}

TEST(FramingTest, AsciiSplitterWrongLrcIsReportedAndTheNextFrameIsFound) {
    FrameSplitter splitter(Mode::Ascii, unknownLength);
    const auto frames = splitter.add(bytesOf(":1103006B000300\r\n:1103006B00037E\r\n"));
    ASSERT_EQ(2U, frames.size());
    EXPECT_TRUE(frames[0].damaged());
    EXPECT_FALSE(frames[1].damaged());
}

TEST(FramingTest, AsciiSplitterEndlessFrameIsGivenUpAsDamaged) {
    FrameSplitter splitter(Mode::Ascii, unknownLength);
    const auto frames = splitter.add(bytesOf(":" + std::string(2000, '0')));
    ASSERT_EQ(1U, frames.size());
    EXPECT_TRUE(frames[0].damaged());
    EXPECT_EQ(kMaxAsciiFrame + 1, frames[0].raw.size());
}

}  // namespace
}  // namespace wire
