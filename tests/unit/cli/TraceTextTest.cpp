#include "cli/TraceText.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string_view>

namespace {

using cli::TraceStyle;
using runtime::TraceDirection;
using values::Bytes;

Bytes bytesOf(std::string_view text) {
    return {text.begin(), text.end()};
}

class TraceTextTest : public testing::Test {
  protected:
    void SetUp() override {
        setenv("TZ", "UTC", 1);
        tzset();
    }
    std::string lineOf(TraceStyle style, TraceDirection direction, const Bytes& bytes,
                       bool complete = true) const {
        return cli::TraceText(style).lineOf({direction, port_, {}, at_, bytes, complete});
    }

    /// 2001-09-09 01:46:40 UTC and 7 ms.
    std::chrono::system_clock::time_point at_{std::chrono::milliseconds(1'000'000'000'007)};
    std::string port_ = "com1";
};

TEST_F(TraceTextTest, ShowsTimePortDirectionAndBytes) {
    const Bytes bytes{0x01, 0x0A, 0xFF};
    EXPECT_EQ("01:46:40.007 com1 > 01 0A FF", lineOf({}, TraceDirection::Sent, bytes));
    EXPECT_EQ("01:46:40.007 com1 < 01 0A FF", lineOf({}, TraceDirection::Received, bytes));
}

TEST_F(TraceTextTest, TellsThatAFrameWasCutShort) {
    EXPECT_EQ("01:46:40.007 com1 < 01 (cut)",
              lineOf({.meaning = true}, TraceDirection::Received, Bytes{0x01}, false));
}

TEST_F(TraceTextTest, TellsThatAFrameCameLate) {
    const Bytes bytes{0x01};
    EXPECT_EQ(
        "01:46:40.007 com1 < 01 (late, thrown away)",
        cli::TraceText({}).lineOf({TraceDirection::Received, port_, {}, at_, bytes, true, true}));
}

TEST_F(TraceTextTest, ShowsAsciiFramesAsCharacters) {
    const TraceStyle ascii{.ascii = true};
    EXPECT_EQ("01:46:40.007 com1 > :010300000001FB",
              lineOf(ascii, TraceDirection::Sent, bytesOf(":010300000001FB\r\n")));
    // What is not as it should be stays visible.
    EXPECT_EQ("01:46:40.007 com1 < \\xff:01\\r",
              lineOf(ascii, TraceDirection::Received, bytesOf("\xFF:01\r")));
    EXPECT_EQ("01:46:40.007 com1 < :01\\n",
              lineOf(ascii, TraceDirection::Received, bytesOf(":01\n")));
}

TEST_F(TraceTextTest, ShowsTheBytesOfAsciiFramesWhenAsked) {
    EXPECT_EQ("01:46:40.007 com1 > 3A 30 31 0D 0A",
              lineOf({.ascii = true, .hex = true}, TraceDirection::Sent, bytesOf(":01\r\n")));
}

TEST_F(TraceTextTest, AddsTheMeaning) {
    EXPECT_EQ("01:46:40.007 com1 > :010300090001F2 | node 1: read 1 holding register at 9",
              lineOf({.ascii = true, .meaning = true}, TraceDirection::Sent,
                     bytesOf(":010300090001F2\r\n")));
}

/// Requests on several lines do not mix.
TEST_F(TraceTextTest, KnowsWhichRequestAReplyAnswers) {
    cli::TraceText text({.meaning = true});
    const Bytes one{0x01, 0x01, 0x00, 0x00, 0x00, 0x02, 0xBD, 0xCB};
    const Bytes other{0x01, 0x01, 0x00, 0x00, 0x00, 0x08, 0x3D, 0xCC};
    const Bytes reply{0x01, 0x01, 0x01, 0x24, 0x51, 0x93};
    const std::string com2 = "com2";
    text.lineOf({TraceDirection::Sent, port_, {}, at_, one, true});
    text.lineOf({TraceDirection::Sent, com2, {}, at_, other, true});
    EXPECT_EQ("01:46:40.007 com1 < 01 01 01 24 51 93 | node 1: 0 0",
              text.lineOf({TraceDirection::Received, port_, {}, at_, reply, true}));
    EXPECT_EQ("01:46:40.007 com2 < 01 01 01 24 51 93 | node 1: 0 0 1 0 0 1 0 0",
              text.lineOf({TraceDirection::Received, com2, {}, at_, reply, true}));
}

}  // namespace
