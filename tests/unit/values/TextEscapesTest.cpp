// Texts of devices on a terminal.
#include "values/TextEscapes.h"

#include <gtest/gtest.h>

#include "tests/unit/values/ValueSupport.h"

namespace {

using values::escapeText;
using values::unescapeText;
using values_test::bytesOf;

struct Row {
    std::string_view bytes;
    std::string_view text;
};

using namespace std::string_view_literals;

constexpr Row kRows[] = {
    {"plain"sv, "plain"},
    {"say \"hi\""sv, "say \\\"hi\\\""},
    {"back\\slash"sv, "back\\\\slash"},
    {"a\nb\rc\td"sv, "a\\nb\\rc\\td"},
    {"a\0b"sv, "a\\0b"},
    {"\x1b[2J"sv, "\\x1b[2J"},  // would clear the screen
    {"\x7f"sv, "\\x7f"},
    {"K\xc3\xbchler"sv, "K\xc3\xbchler"},            // u umlaut in UTF-8
    {"K\xfchler"sv, "K\\xfchler"},                   // u umlaut in Latin-1
    {"\xc2\x9b"sv, "\\xc2\\x9b"},                    // a control character in UTF-8
    {"\xc0\x80"sv, "\\xc0\\x80"},                    // overlong
    {"\xed\xa0\x80"sv, "\\xed\\xa0\\x80"},           // surrogate
    {"\xf4\x90\x80\x80"sv, "\\xf4\\x90\\x80\\x80"},  // beyond U+10FFFF
    {"\xe2\x82\xac"sv, "\xe2\x82\xac"},              // euro sign
    {"\xe2\x82"sv, "\\xe2\\x82"},                    // cut
    {"\xf0\x9f\x94\xa7"sv, "\xf0\x9f\x94\xa7"},      // four bytes
};

TEST(TextEscapesTest, KeepPrintableTextAndHideTheRest) {
    for (const Row& row : kRows)
        EXPECT_EQ(row.text, escapeText(bytesOf(row.bytes)));
}

TEST(TextEscapesTest, AreUndone) {
    for (const Row& row : kRows) {
        EXPECT_EQ(bytesOf(row.bytes), unescapeText(row.text)) << row.text;
        EXPECT_EQ(bytesOf(row.bytes), unescapeText('"' + std::string(row.text) + '"')) << row.text;
    }
}

TEST(TextEscapesTest, PrintableTextKeepsQuotesAndBackslashes) {
    EXPECT_EQ("a \"b\" c:\\d", values::printableText("a \"b\" c:\\d"));
    EXPECT_EQ("\\x1b[2J\\x0a\\x00\\xff\\x7f\\xc2\\x9b",
              values::printableText("\x1b[2J\n\0\xff\x7f\xc2\x9b"sv));
    EXPECT_EQ("K\xc3\xbchler", values::printableText("K\xc3\xbchler"));
}

TEST(TextEscapesTest, QuotesInsideAnUnquotedTextStandForThemselves) {
    EXPECT_EQ(bytesOf("a\"b\""), unescapeText("a\"b\""));
}

TEST(TextEscapesTest, HexadecimalDigitsMayBeUpperCase) {
    EXPECT_EQ(bytesOf("\xaf"), unescapeText("\\xAf"));
}

}  // namespace
