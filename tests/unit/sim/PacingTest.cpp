#include "sim/Pacing.h"

#include <gtest/gtest.h>

#include <limits>

namespace sim {
namespace {

using namespace std::chrono_literals;
using wire::LineRate;
using wire::Mode;

TEST(PacingTest, ShortCharactersTravelInTheSmallestGroupsOfAHundredMicroseconds) {
    struct Row {
        LineRate rate;
        std::size_t group;
    };
    for (const Row& row : {
             Row{{.baud = 300, .characterBits = 11}, 1},
             Row{{.baud = 9600, .characterBits = 11}, 1},
             Row{{.baud = 57600, .characterBits = 10}, 1},
             Row{{.baud = 100000, .characterBits = 10}, 1},
             Row{{.baud = 115200, .characterBits = 10}, 2},
             Row{{.baud = 115200, .characterBits = 11}, 2},
             Row{{.baud = 921600, .characterBits = 10}, 10},
         }) {
        EXPECT_EQ(row.group, groupOf(row.rate)) << row.rate.baud;
    }
    EXPECT_EQ(std::numeric_limits<std::size_t>::max(), groupOf({.baud = 0}));
}

TEST(PacingTest, OnlyAnRtuSlaveOnALineWithARateKeepsASilence) {
    const LineRate slow{.baud = 9600, .characterBits = 10};
    EXPECT_EQ(wire::silenceBetweenFrames(slow), silenceBeforeReply(Mode::Rtu, slow));
    EXPECT_EQ(1750us, silenceBeforeReply(Mode::Rtu, {.baud = 115200}));
    EXPECT_EQ(0ns, silenceBeforeReply(Mode::Ascii, slow));
    EXPECT_EQ(0ns, silenceBeforeReply(Mode::Rtu, {.baud = 0}));
}

}  // namespace
}  // namespace sim
