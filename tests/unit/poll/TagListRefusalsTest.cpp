// What is said against lists of tags: each time one place, one rule, and what was expected.
#include <fmt/format.h>
#include <gtest/gtest.h>

#include "poll/TagList.h"

namespace poll {
namespace {

/// @return "line:column: rule: text" for each complaint.
std::vector<std::string> complaintsOf(std::string_view text) {
    std::vector<std::string> told;
    for (const ListComplaint& each : parseTagList(text, "tags.csv").complaints) {
        EXPECT_EQ("tags.csv", each.file);
        told.push_back(fmt::format("{}:{}: {}: {}", each.line, each.column, each.rule, each.text));
    }
    return told;
}

struct Case {
    const char* text;
    const char* complaint;
};

void PrintTo(const Case& each, std::ostream* out) {
    *out << testing::PrintToString(each.text);
}

class TagListRefusalsTest : public testing::TestWithParam<Case> {};

TEST_P(TagListRefusalsTest, TellsPlaceAndExpectation) {
    EXPECT_EQ(std::vector<std::string>{GetParam().complaint}, complaintsOf(GetParam().text));
}

constexpr const char* kNothing =
    "1:1: empty-list: no tag: expected a header line with name and uri and a line for each tag, or "
    "a URI a line";

INSTANTIATE_TEST_SUITE_P(
    Whole, TagListRefusalsTest,
    testing::Values(Case{"", kNothing}, Case{"\xEF\xBB\xBF", kNothing},
                    Case{"\n# nothing\n \n", kNothing}, Case{"name,uri\n", kNothing},
                    Case{"name,uri,comment\na,u,x\nb,v,gr\xFC\xDF\n",
                         "3:7: not-utf-8: byte 0xFC is no UTF-8: expected a file saved as UTF-8"}));

INSTANTIATE_TEST_SUITE_P(
    Headers, TagListRefusalsTest,
    testing::Values(
        Case{"name,uri,perido\na,u,1\n",
             "1:10: unknown-column: unknown column 'perido': expected 'period', perhaps"},
        Case{"name,uri,address\na,u,1\n",
             "1:10: unknown-column: unknown column 'address': expected one of name, uri, period, "
             "scale, offset, unit, decimals, low, high, comment"},
        Case{"name,uri,\na,u,1\n",
             "1:10: unknown-column: unknown column '': expected one of name, uri, period, scale, "
             "offset, unit, decimals, low, high, comment"},
        Case{"name,uri,unit,Unit\na,u,m,s\n",
             "1:15: duplicate-column: a second column 'unit': expected each once"},
        Case{"\n name,unit\na,m\n",
             "2:2: missing-column: no column 'uri': expected 'name' and 'uri' in the header line"},
        Case{"uri,unit\na,m\n",
             "1:1: missing-column: no column 'name': expected 'name' and 'uri' in the header line"},
        Case{
            "name;uri\na;u\n",
            "1:1: no-header: columns that are not separated by commas: expected a header line like "
            "'name,uri,unit', or a list of URIs, one a line"},
        Case{"pump\n",
             "1:1: no-header: 'pump' is neither a header line nor a URI: expected a header line "
             "like 'name,uri,unit', or a list of URIs, one a line"}));

INSTANTIATE_TEST_SUITE_P(
    Fields, TagListRefusalsTest,
    testing::Values(
        Case{"name,uri,unit\na,u\nb,v,m\n",
             "2:3: field-count: 2 fields: expected 3 as in the header line"},
        Case{"name,uri,scale\na,u,0,1\nb,v,2\n",
             "2:7: field-count: 4 fields: expected 3 as in the header line; a field that holds a "
             "comma needs double quotes, a number a decimal point"},
        Case{
            "name,uri,comment\na,u,x\nb,v,\"long\nc,w,y\n",
            "3:5: unclosed-quote: this quote is not closed: expected another before the end of the "
            "file"},
        Case{
            "name,uri\na,\"u\" v\nb,v\n",
            "2:7: text-behind-quote: text behind the closing quote: expected a comma or the end of "
            "the line; a quote within a field is written twice"},
        Case{"name,uri,comment\na,u,5\" pipe\n",
             "2:6: stray-quote: a quote within a field: expected the whole field in double quotes, "
             "and the quotes in it doubled"}));

INSTANTIATE_TEST_SUITE_P(
    Cells, TagListRefusalsTest,
    testing::Values(
        Case{"name,uri\n,u\nb,v\n", "2:1: empty-name: no name: expected one for every tag"},
        Case{"name,uri\na, \nb,v\n", "2:4: empty-uri: no uri: expected one for every tag"},
        Case{"name,uri\na,u\nb,v\n a,w\n",
             "4:2: duplicate-name: a second tag 'a', see line 2: expected a name of its own"},
        Case{
            "name,uri\na=b,u\nb,v\n",
            "2:1: name-with-equals: 'a=b': expected a name without '=', which ends it where values "
            "are written"},
        Case{"name,uri\n\"a\nb\",u\nb,v\n",
             "2:1: control-character: a line end or another control character: expected a name "
             "without"},
        Case{"name,uri,period\na,u,0\n",
             "2:5: bad-period: '0': expected a period of whole milliseconds, from 1 to 86400000"},
        Case{"name,uri,period\na,u,-5s\n",
             "2:5: bad-period: '-5s': expected a period of whole milliseconds, from 1 to 86400000"},
        Case{"name,uri,period\na,u,0.5\n",
             "2:5: bad-period: '0.5': expected a period of whole milliseconds, from 1 to 86400000"},
        Case{"name,uri,period\na,u,fast\n",
             "2:5: not-a-number: 'fast': expected milliseconds, e.g. 500, or 500ms, or 2s"},
        Case{
            "name,uri,scale\na,u,\"0,1\"\n",
            "2:5: not-a-number: '0,1' has a decimal comma: expected a number with a decimal point, "
            "0.1"},
        Case{"name,uri,offset\na,u,x\n", "2:5: not-a-number: 'x': expected a number"},
        Case{"name,uri,low\na,u,nan\n", "2:5: not-a-number: 'nan': expected a number"},
        Case{"name,uri,high\na,u,+-1\n", "2:5: not-a-number: '+-1': expected a number"},
        Case{"name,uri,high\na,u,1e999\n", "2:5: not-a-number: '1e999': expected a number"},
        Case{"name,uri,scale\na,u,0.0\n",
             "2:5: zero-scale: a scale of 0 hides every value: expected another number"},
        Case{"name,uri,decimals\na,u,16\n",
             "2:5: bad-decimals: '16': expected the digits behind the decimal point, 0 to 15"},
        Case{"name,uri,decimals\na,u,1.5\n",
             "2:5: bad-decimals: '1.5': expected the digits behind the decimal point, 0 to 15"}));

TEST(TagListRefusalsTest, OneRunTellsEverythingInTheOrderOfTheFile) {
    const TagList list = parseTagList("name,uri,scale\na,u,x\nb\na,v,1\n\xFF,w,2\n,\"\n", "t");
    std::vector<std::string> rules;
    for (const ListComplaint& each : list.complaints)
        rules.emplace_back(each.rule);
    EXPECT_EQ((std::vector<std::string>{"not-a-number", "field-count", "duplicate-name",
                                        "not-utf-8", "unclosed-quote"}),
              rules);
    EXPECT_EQ(3U, list.tags.size());
}

}  // namespace
}  // namespace poll
