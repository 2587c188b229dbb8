#include "sim/LineEvent.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

TEST(DescribeTest, RtuShowsBytesInHexadecimal) {
    EXPECT_EQ(
        describe({.kind = LineEvent::Kind::request, .raw = {0x02, 0x07, 0x41, 0xFE}}, Mode::rtu),
        "request 02 07 41 FE");
}

TEST(DescribeTest, AsciiShowsCharactersWithoutTheLineEnd) {
    EXPECT_EQ(
        describe({.kind = LineEvent::Kind::reply, .raw = {':', '0', '2', 0x1B, 0x80, '\r', '\n'}},
                 Mode::ascii),
        "reply :02..");
}

TEST(DescribeTest, EveryKindHasItsName) {
    EXPECT_EQ(describe({.kind = LineEvent::Kind::hangUp, .raw = {}}, Mode::rtu), "hang-up");
    EXPECT_STREQ(nameOf(LineEvent::Kind::request), "request");
    EXPECT_STREQ(nameOf(LineEvent::Kind::damaged), "damaged");
    EXPECT_STREQ(nameOf(LineEvent::Kind::reply), "reply");
}

}  // namespace
}  // namespace sim
