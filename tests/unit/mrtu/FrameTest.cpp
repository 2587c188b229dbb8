// Check sums, RTU frames and the texts of exceptions.
#include "mrtu/Frame.h"

#include <gtest/gtest.h>

#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;
using testing_support::characters;
using testing_support::hex;
using testing_support::toHex;

std::uint16_t crc(const Bytes& data) {
    return calcCRC(data.data(), static_cast<int>(data.size()));
}

Bytes bytesOf(const _MRTU::Frame& frame) {
    return {frame.bytes.begin(), frame.bytes.begin() + frame.length};
}

TEST(FrameTest, ChecksumCrcComesSwappedForComparisonWithTheFrame) {
    EXPECT_EQ(0xC5CD, crc(hex("01 03 00 00 00 0A")));
    EXPECT_EQ(0x374B, crc(characters("123456789"))) << "published check value 0x4B37";
    EXPECT_EQ(0xFFFF, crc({})) << "the start value";
    EXPECT_EQ(0xBF40, crc(hex("00"))) << "published value 0x40BF of one zero byte";
}

TEST(FrameTest, ChecksumCrcAgreesWithAnotherWayOfComputingIt) {
    Bytes data;
    for (int length = 0; length < 300; ++length) {
        const Bytes expected = testing_support::crcOf(data);
        EXPECT_EQ(expected[0] * 256 + expected[1], crc(data)) << "length " << length;
        data.push_back(static_cast<std::uint8_t>(length * 37 + 11));
    }
}

TEST(FrameTest, ChecksumLrcMakesTheSumZero) {
    EXPECT_EQ(0xF2, _MRTU::calcLrc(hex("01 03 00 00 00 0A")));
    EXPECT_EQ(0x00, _MRTU::calcLrc({}));
    EXPECT_EQ(0x00, _MRTU::calcLrc(hex("80 80")));
    EXPECT_EQ(0xFF, _MRTU::calcLrc(hex("01")));
    EXPECT_EQ(0x01, _MRTU::calcLrc(hex("FF")));
    EXPECT_EQ(0x80, _MRTU::calcLrc(hex("80")));
}

TEST(FrameTest, RtuGoldenRequest) {
    const Bytes message = hex("01 03 00 00 00 0A");
    EXPECT_EQ("01 03 00 00 00 0A C5 CD", toHex(bytesOf(_MRTU::frameRtu(message))));
}

TEST(FrameTest, RtuGoldenRequestOfTheStandard) {
    const Bytes message = hex("11 05 00 AC FF 00");
    EXPECT_EQ("11 05 00 AC FF 00 4E 8B", toHex(bytesOf(_MRTU::frameRtu(message))));
}

TEST(FrameTest, RtuLongestMessageFillsAFrame) {
    const Bytes message(_MRTU::kMaxMessage, 0x5A);
    const Bytes frame = bytesOf(_MRTU::frameRtu(message));
    EXPECT_EQ(256U, frame.size());
    EXPECT_EQ(toHex(testing_support::rtuFrame(message)), toHex(frame));
}

TEST(FrameTest, RtuFramesOfFiveBytesAndMoreAreGoodWithTheirCrc) {
    for (std::size_t length = 0; length <= 254; ++length) {
        const Bytes frame = testing_support::rtuFrame(Bytes(length, 0x11));
        EXPECT_EQ(frame.size() > 4, _MRTU::isGoodRtuFrame(frame)) << toHex(frame);
    }
}

TEST(FrameTest, RtuEveryTruncationOfAGoodFrameIsBad) {
    const Bytes good = testing_support::rtuFrame(hex("01 03 04 12 34 56 78"));
    ASSERT_TRUE(_MRTU::isGoodRtuFrame(good));
    for (std::size_t length = 0; length < good.size(); ++length)
        EXPECT_FALSE(_MRTU::isGoodRtuFrame(testing_support::firstOf(good, length))) << length;
}

TEST(FrameTest, RtuEveryFlippedBitMakesAFrameBad) {
    const Bytes good = testing_support::rtuFrame(hex("01 03 04 12 34 56 78"));
    for (std::size_t bit = 0; bit < good.size() * 8; ++bit) {
        Bytes bad = good;
        bad[bit / 8] = static_cast<std::uint8_t>(bad[bit / 8] ^ (1U << (bit % 8)));
        EXPECT_FALSE(_MRTU::isGoodRtuFrame(bad)) << "bit " << bit;
    }
}

TEST(FrameTest, RtuSwappedCrcIsBad) {
    EXPECT_FALSE(_MRTU::isGoodRtuFrame(hex("01 03 00 00 00 0A CD C5")));
}

TEST(FrameTest, MessageWordsGoHighByteFirst) {
    _MRTU::Message message;
    message.put(0x11);
    message.putWord(0x1234);
    EXPECT_EQ("11 12 34", toHex({message.view().begin(), message.view().end()}));
    EXPECT_EQ(3, message.length());
    EXPECT_EQ(0x12, message[1]);
}

TEST(FrameTest, MessageTellsWhatStillFits) {
    _MRTU::Message message;
    EXPECT_TRUE(message.fits(254));
    EXPECT_FALSE(message.fits(255));
    EXPECT_FALSE(message.fits(-1));
    message.put(1);
    EXPECT_TRUE(message.fits(253));
    EXPECT_FALSE(message.fits(254));
}

}  // namespace
