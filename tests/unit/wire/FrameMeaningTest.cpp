#include "wire/FrameMeaning.h"

#include <gtest/gtest.h>

#include "wire/Framing.h"

namespace {

using wire::Bytes;
using wire::FrameMeaning;
using wire::Mode;

struct Row {
    Bytes request;  // Without their checks.
    Bytes reply;
    const char* asked;
    const char* answered;
};

const Row kRows[] = {
    {{1, 1, 0, 0, 0, 8}, {1, 1, 1, 0x24}, "node 1: read 8 coils at 0", "node 1: 0 0 1 0 0 1 0 0"},
    {{1, 1, 0, 5, 0, 1}, {1, 1, 1, 1}, "node 1: read 1 coil at 5", "node 1: 1"},
    {{2, 2, 1, 0, 0, 3}, {2, 2, 1, 5}, "node 2: read 3 discrete inputs at 256", "node 2: 1 0 1"},
    {{1, 3, 0, 9, 0, 1},
     {1, 3, 2, 3, 0xF1},
     "node 1: read 1 holding register at 9",
     "node 1: 1009"},
    {{1, 4, 0, 0, 0, 2},
     {1, 4, 4, 0x79, 0x18, 0xFF, 0xFF},
     "node 1: read 2 input registers at 0",
     "node 1: 31000 65535"},
    {{1, 3, 0x13, 0x88, 0, 1},
     {1, 3, 4, 0x23, 0xC3, 0x8C, 0x50},
     "node 1: read 1 holding register at 5000",
     "node 1: 600018000"},
    {{1, 5, 0, 4, 0xFF, 0},
     {1, 5, 0, 4, 0xFF, 0},
     "node 1: write coil at 4: on",
     "node 1: written"},
    {{1, 5, 0, 4, 0, 0}, {1, 5, 0, 4, 0, 0}, "node 1: write coil at 4: off", "node 1: written"},
    {{1, 5, 0, 4, 1, 0},
     {0x01, 0x85, 3},
     "node 1: write coil at 4: 0x0100",
     "node 1: exception 3, illegal data value"},
    {{1, 6, 0, 0, 0xFF, 0xFB},
     {1, 6, 0, 0, 0xFF, 0xFB},
     "node 1: write holding register at 0: 65531",
     "node 1: written"},
    {{1, 6, 0x13, 0x88, 0, 1, 0, 0},
     {1, 6, 0x13, 0x88, 0, 1, 0, 0},
     "node 1: write 32-bit register at 5000: 65536",
     "node 1: written"},
    {{1, 15, 0, 0, 0, 4, 1, 9},
     {1, 15, 0, 0, 0, 4},
     "node 1: write 4 coils at 0: 1 0 0 1",
     "node 1: written"},
    {{1, 16, 0, 9, 0, 2, 4, 0x40, 0x50, 0, 0},
     {1, 16, 0, 9, 0, 2},
     "node 1: write 2 holding registers at 9: 16464 0",
     "node 1: written"},
    {{1, 16, 0x13, 0x88, 0, 1, 4, 0, 1, 0, 0},
     {1, 16, 0x13, 0x88, 0, 1},
     "node 1: write 1 32-bit register at 5000: 65536",
     "node 1: written"},
    {{1, 3, 0, 9, 0, 1},
     {1, 0x83, 2},
     "node 1: read 1 holding register at 9",
     "node 1: exception 2, illegal data address"},
    {{1, 3, 0, 9, 0, 1},
     {1, 0x83, 99},
     "node 1: read 1 holding register at 9",
     "node 1: exception 99"},
    {{1, 43, 14, 1, 0}, {1, 43, 14}, "node 1: function 43, 3 bytes", "node 1: function 43, 1 byte"},
};

TEST(FrameMeaningTest, OfRequestAndReplyInBothModes) {
    for (const Mode mode : {Mode::Rtu, Mode::Ascii}) {
        for (const Row& row : kRows) {
            FrameMeaning meaning(mode);
            EXPECT_EQ(row.asked, meaning.ofRequest(wire::encodeFrame(mode, row.request)));
            EXPECT_EQ(row.answered, meaning.ofReply(wire::encodeFrame(mode, row.reply)))
                << row.asked;
        }
    }
}

TEST(FrameMeaningTest, ABroadcastIsForAllNodes) {
    EXPECT_EQ("all nodes: write coil at 4: on", FrameMeaning(Mode::Rtu).ofRequest(wire::encodeFrame(
                                                    Mode::Rtu, Bytes{0, 5, 0, 4, 0xFF, 0})));
}

TEST(FrameMeaningTest, AFrameWithAWrongCheckIsDamaged) {
    const Bytes request{1, 3, 0, 9, 0, 1};
    for (const Mode mode : {Mode::Rtu, Mode::Ascii}) {
        FrameMeaning meaning(mode);
        EXPECT_EQ("damaged", meaning.ofRequest(wire::encodeFrame(mode, request, true)));
        EXPECT_EQ("damaged", meaning.ofReply(Bytes{0x01}));
    }
}

TEST(FrameMeaningTest, AReplyThatNobodyAskedForIsToldApart) {
    FrameMeaning meaning(Mode::Rtu);
    const Bytes reply = wire::encodeFrame(Mode::Rtu, Bytes{2, 3, 2, 3, 0xF1});
    EXPECT_EQ("node 2: 1009 (not what was asked for)", meaning.ofReply(reply));
    meaning.ofRequest(wire::encodeFrame(Mode::Rtu, Bytes{1, 3, 0, 9, 0, 1}));
    EXPECT_EQ("node 2: 1009 (not what was asked for)", meaning.ofReply(reply));
}

TEST(FrameMeaningTest, LongListsAreCut) {
    FrameMeaning meaning(Mode::Rtu);
    meaning.ofRequest(wire::encodeFrame(Mode::Rtu, Bytes{1, 1, 0, 0, 0, 17}));
    EXPECT_EQ("node 1: 1 0 0 0 0 0 0 0 0 0 0 0 0 0 0 0 ...",
              meaning.ofReply(wire::encodeFrame(Mode::Rtu, Bytes{1, 1, 3, 1, 0, 1})));
}

/// Frames come from outside: any bytes behind node and function have some meaning.
TEST(FrameMeaningTest, OfEveryTruncationIsHarmless) {
    for (int function = 0; function < 256; ++function) {
        for (std::size_t size = 2; size < 12; ++size) {
            Bytes message(size, 0x11);
            message[1] = static_cast<std::uint8_t>(function);
            FrameMeaning meaning(Mode::Rtu);
            const Bytes frame = wire::encodeFrame(Mode::Rtu, message);
            EXPECT_EQ(0U, meaning.ofRequest(frame).find("node 17: ")) << function << ' ' << size;
            EXPECT_EQ(0U, meaning.ofReply(frame).find("node 17: ")) << function << ' ' << size;
        }
    }
}

}  // namespace
