// The document as a text: what a byte-wise reader of the field relies on.
#include <expat.h>
#include <gtest/gtest.h>

#include <memory>
#include <sstream>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";

TEST(LayoutTest, IsWellFormed) {
    const std::unique_ptr<XML_ParserStruct, decltype(&XML_ParserFree)> parser(
        XML_ParserCreate(nullptr), &XML_ParserFree);
    const std::string text = inflateDocument().text;
    const XML_Status status =
        XML_Parse(parser.get(), text.data(), static_cast<int>(text.size()), XML_TRUE);
    EXPECT_EQ(XML_STATUS_OK, status) << XML_ErrorString(XML_GetErrorCode(parser.get()))
                                     << " in line " << XML_GetCurrentLineNumber(parser.get());
}

TEST(LayoutTest, StartsWithByteOrderMarkAndDeclaration) {
    const std::string text = inflateDocument().text;
    ASSERT_TRUE(text.starts_with(byteOrderMark));
    EXPECT_TRUE(text.substr(byteOrderMark.size())
                    .starts_with("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<protocol_cfg>\n"));
}

TEST(LayoutTest, EndsWithALineFeed) {
    EXPECT_TRUE(inflateDocument().text.ends_with("\n</protocol_cfg>\n"));
}

TEST(LayoutTest, HasNeitherCarriageReturnsNorTabs) {
    EXPECT_EQ(std::string::npos, inflateDocument().text.find_first_of("\r\t"));
}

/// How many levels deeper the line leads: tags that it opens minus tags that it closes.
int levelsOpened(const std::string& line) {
    if (line.find("</") != std::string::npos || line.find("/>") != std::string::npos) return 0;
    return line.starts_with("<?") ? 0 : 1;
}

TEST(LayoutTest, EveryElementStandsOnItsOwnLineIndentedByFourSpacesALevel) {
    std::istringstream text(inflateDocument().text.substr(byteOrderMark.size()));
    std::size_t level = 0;
    for (std::string line; std::getline(text, line);) {
        const std::size_t indent = line.find_first_not_of(' ');
        ASSERT_NE(indent, std::string::npos) << "an empty line";
        const std::string content = line.substr(indent);
        const bool closes = content.starts_with("</");
        if (closes) --level;
        EXPECT_EQ(4 * level, indent) << line;
        EXPECT_EQ('<', content.front()) << line;
        if (!closes) level += static_cast<std::size_t>(levelsOpened(content));
    }
    EXPECT_EQ(0U, level);
}

TEST(LayoutTest, EmptyElementEndsWithoutABlank) {
    EXPECT_NE(
        inflateDocument().text.find("\n    <plcnet alwaysEnable=\"false\" locator=\"slaveid\"/>\n"),
        std::string::npos);
}

TEST(LayoutTest, GreaterThanStandsUnescapedInDisplayTexts) {
    const std::string text = inflateDocument().text;
    EXPECT_NE(text.find("display=\"ABCD->CDAB\""), std::string::npos);
    EXPECT_EQ(std::string::npos, text.find('&'));
}

}  // namespace
}  // namespace description_test
