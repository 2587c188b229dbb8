#include "sim/LineEvent.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

using wire::Mode;
TEST(LineEventTest, RtuShowsBytesInHexadecimal) {
    EXPECT_EQ(
        "request 02 07 41 FE",
        describe({.kind = LineEvent::Kind::Request, .raw = {0x02, 0x07, 0x41, 0xFE}}, Mode::Rtu));
}

TEST(LineEventTest, AsciiShowsCharactersWithoutTheLineEnd) {
    EXPECT_EQ("reply :02..", describe({.kind = LineEvent::Kind::Reply,
                                       .raw = {':', '0', '2', 0x1B, 0x80, '\r', '\n'}},
                                      Mode::Ascii));
}

TEST(LineEventTest, EveryKindHasItsName) {
    EXPECT_EQ("hang-up", describe({.kind = LineEvent::Kind::HangUp, .raw = {}}, Mode::Rtu));
    EXPECT_STREQ("request", nameOf(LineEvent::Kind::Request));
    EXPECT_STREQ("damaged", nameOf(LineEvent::Kind::Damaged));
    EXPECT_STREQ("reply", nameOf(LineEvent::Kind::Reply));
    EXPECT_STREQ("lost", nameOf(LineEvent::Kind::Lost));
}

}  // namespace
}  // namespace sim
