// Bytes as keys, whatever pieces they come in.
#include "cli/poll/KeyDecoder.h"

#include <gtest/gtest.h>

namespace {

using cli::Key;
using cli::KeyDecoder;
using cli::KeyKind;
using Keys = std::vector<Key>;

struct Row {
    const char* bytes;
    Keys keys;
};

const std::vector<Row> kRows{
    {"q", {{KeyKind::Character, "q"}}},
    {"ä", {{KeyKind::Character, "ä"}}},
    {"\x1B[A\x1B[B", {{KeyKind::Up, ""}, {KeyKind::Down, ""}}},
    {"\x1BOA\x1BOB", {{KeyKind::Up, ""}, {KeyKind::Down, ""}}},
    {"\x1B[5~\x1B[6~", {{KeyKind::PageUp, ""}, {KeyKind::PageDown, ""}}},
    {"\x1B[H\x1B[F\x1B[1~\x1B[4~",
     {{KeyKind::Home, ""}, {KeyKind::End, ""}, {KeyKind::Home, ""}, {KeyKind::End, ""}}},
    {"\r\n", {{KeyKind::Enter, ""}, {KeyKind::Enter, ""}}},
    {"\x7F\b", {{KeyKind::Backspace, ""}, {KeyKind::Backspace, ""}}},
    {"\f", {{KeyKind::Redraw, ""}}},
    {"\x1B[15~x", {{KeyKind::Character, "x"}}},   // F5 means nothing here.
    {"\x1B[1;5Cx", {{KeyKind::Character, "x"}}},  // Nor does Ctrl-Right.
    {"\x01x", {{KeyKind::Character, "x"}}},
    {"\x1Bx", {{KeyKind::Escape, ""}, {KeyKind::Character, "x"}}},
};

TEST(KeyDecoderTest, KnowsTheKeys) {
    for (const Row& row : kRows) {
        KeyDecoder decoder;
        EXPECT_EQ(row.keys, decoder.feed(row.bytes)) << testing::PrintToString(row.bytes);
        EXPECT_FALSE(decoder.waiting());
    }
}

TEST(KeyDecoderTest, TakesThemByteByByte) {
    for (const Row& row : kRows) {
        KeyDecoder decoder;
        Keys keys;
        for (const char byte : std::string_view(row.bytes)) {
            for (const Key& key : decoder.feed({&byte, 1}))
                keys.push_back(key);
        }
        EXPECT_EQ(row.keys, keys) << testing::PrintToString(row.bytes);
    }
}

TEST(KeyDecoderTest, TakesEscapeAloneWhenNothingFollows) {
    KeyDecoder decoder;
    EXPECT_EQ(Keys{}, decoder.feed("\x1B"));
    EXPECT_TRUE(decoder.waiting());
    EXPECT_EQ((Key{KeyKind::Escape, ""}), decoder.idle());
    EXPECT_FALSE(decoder.waiting());
}

TEST(KeyDecoderTest, ThrowsAwayWhatNeverEnds) {
    KeyDecoder decoder;
    decoder.feed("\x1B[");
    EXPECT_FALSE(decoder.idle());
    EXPECT_EQ((Keys{{KeyKind::Character, "q"}}), decoder.feed("q"));

    decoder.feed("\x1B[" + std::string(1000, '1'));
    EXPECT_LT(decoder.idle().has_value(), 1);
    EXPECT_EQ((Keys{{KeyKind::Character, "q"}}), decoder.feed("q"));
}

}  // namespace
