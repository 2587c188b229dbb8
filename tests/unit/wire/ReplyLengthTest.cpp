#include <gtest/gtest.h>

#include <string_view>

#include "tests/unit/wire/Exchanges.h"

namespace wire {
namespace {

TEST(ReplyLengthTest, TheLengthGrowsWithWhatHasComeAndNeverExceedsTheReply) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            const Bytes frame = encodeFrame(mode, reply);
            std::size_t before = frameLength(mode, 3);
            for (std::size_t count = 0; count <= frame.size(); ++count) {
                const std::size_t length = replyLength(asked, ByteView(frame).first(count));
                EXPECT_LE(before, length) << nameOf(mode, request) << count;
                EXPECT_GE(frame.size(), length) << nameOf(mode, request) << count;
                before = length;
            }
        }
    }
}

TEST(ReplyLengthTest, TheLengthIsKnownAsSoonAsItCanBe) {
    const Request asked = requestOf(Mode::Rtu, kRead);
    EXPECT_EQ(5U, replyLength(asked, {}));
    EXPECT_EQ(5U, replyLength(asked, Bytes{1}));
    EXPECT_EQ(11U, replyLength(asked, Bytes{1, 3}));  // 17 with long registers.
    EXPECT_EQ(11U, replyLength(asked, Bytes{1, 3, 6}));
    EXPECT_EQ(17U, replyLength(asked, Bytes{1, 3, 12}));
    EXPECT_EQ(5U, replyLength(asked, Bytes{1, 0x83}));
    const Request inAscii = requestOf(Mode::Ascii, kRead);
    EXPECT_EQ(11U, replyLength(inAscii, {}));
    EXPECT_EQ(11U, replyLength(inAscii, Bytes{':', '0', '1', '0'}));
    EXPECT_EQ(23U, replyLength(inAscii, Bytes{':', '0', '1', '0', '3'}));
}

TEST(ReplyLengthTest, WhatBeginsOtherwiseHasNoLength) {
    const Request asked = requestOf(Mode::Rtu, kRead);
    for (const Bytes& other : {Bytes{2}, Bytes{1, 4}, Bytes{1, 0x84}, Bytes{1, 3, 4}})
        EXPECT_EQ(0U, replyLength(asked, other)) << hexText(other);
    const Request inAscii = requestOf(Mode::Ascii, kRead);
    for (const std::string_view other : {"0103", ":02", ":0g", ":010304", ":0 "})
        EXPECT_EQ(0U, replyLength(inAscii, Bytes(other.begin(), other.end()))) << other;
    const Request write = requestOf(Mode::Rtu, {1, 6, 0, 1, 0, 3});
    EXPECT_EQ(8U, replyLength(write, Bytes{1, 6, 0, 1, 0}));
    EXPECT_EQ(0U, replyLength(write, Bytes{1, 6, 0, 2}));
    EXPECT_EQ(0U, replyLength(write, Bytes{1, 6, 0, 1, 0, 4}));
}

}  // namespace
}  // namespace wire
