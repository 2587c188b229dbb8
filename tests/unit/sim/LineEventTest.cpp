#include "sim/LineEvent.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

using wire::Mode;
TEST(LineEventTest, RtuShowsBytesInHexadecimal) {
    EXPECT_EQ(
        "request 02 07 41 FE",
        describe({.kind = LineEvent::Kind::request, .raw = {0x02, 0x07, 0x41, 0xFE}}, Mode::rtu));
}

TEST(LineEventTest, AsciiShowsCharactersWithoutTheLineEnd) {
    EXPECT_EQ("reply :02..", describe({.kind = LineEvent::Kind::reply,
                                       .raw = {':', '0', '2', 0x1B, 0x80, '\r', '\n'}},
                                      Mode::ascii));
}

TEST(LineEventTest, EveryKindHasItsName) {
    EXPECT_EQ("hang-up", describe({.kind = LineEvent::Kind::hangUp, .raw = {}}, Mode::rtu));
    EXPECT_STREQ("request", nameOf(LineEvent::Kind::request));
    EXPECT_STREQ("damaged", nameOf(LineEvent::Kind::damaged));
    EXPECT_STREQ("reply", nameOf(LineEvent::Kind::reply));
}

}  // namespace
}  // namespace sim
