// docs/tag-uri.md, table by table, against the plug-in file.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <regex>

#include "tests/docs/DriverOfThePage.h"
#include "tests/docs/Page.h"

namespace docs_test {
namespace {

using testing_support::hex;
using testing_support::toHex;

const Page& page() {
    static const Page read("docs/tag-uri.md");
    return read;
}

/// "1..9, 12..20 in model 3" -> its bounds.
struct Range {
    int first;
    int last;
};

std::vector<Range> rangesIn(const std::string& cell) {
    std::vector<Range> ranges;
    for (std::size_t dots = cell.find(".."); dots != std::string::npos;
         dots = cell.find("..", dots + 1)) {
        const std::size_t begin = cell.find_last_of(' ', dots) + 1;
        ranges.push_back({std::stoi(cell.substr(begin)), std::stoi(cell.substr(dots + 2))});
    }
    return ranges;
}

bool contains(const std::vector<Range>& ranges, int number) {
    return std::any_of(ranges.begin(), ranges.end(), [number](const Range& range) {
        return range.first <= number && number <= range.last;
    });
}

/// A type that the area takes.
std::string typeFor(const std::string& area) {
    if (area == "LONG") return "int";
    if (area == "SP_Baud") return "unsignedInt";
    if (area == "INP" || area == "OUTP" || area == "NP_Mode" || area == "SP_Done") return "boolean";
    if (area == "HREG" || area == "IREG") return "short";
    return "unsignedByte";
}

/// The texts of the description's elements of that name, in order.
Texts described(const std::string& element) {
    const std::string document = Page("description/mrtu.xml").text();
    const std::regex text(">([A-Za-z0-9_]+)</" + element + '>');
    Texts texts;
    for (std::sregex_iterator each(document.begin(), document.end(), text), end; each != end;
         ++each)
        texts.push_back((*each)[1]);
    return texts;
}

Texts firstColumn(const std::string& heading) {
    Texts texts;
    for (const Row& row : page().table(heading))
        for (const std::string& code : codeIn(row.at(0)))
            texts.push_back(code);
    return texts;
}

TEST(TagUriPageTest, AreasAndConversionsAreThoseOfTheDescription) {
    EXPECT_THAT(firstColumn("## Areas and their ranges"),
                testing::UnorderedElementsAreArray(described("memtype")));
    EXPECT_THAT(firstColumn("## Conversions"),
                testing::UnorderedElementsAreArray(described("conversion")));
}

TEST(TagUriPageTest, TagsSendWhatTheirExamplesSay) {
    for (const Row& row : page().table("### Examples of writing")) {
        ASSERT_EQ(4U, row.size());
        DriverOfThePage driver(row[0]);
        const std::string uri = onlyCodeIn(row[1]);
        const ITag* const tag = driver.create(uri);
        ASSERT_NE(nullptr, tag) << uri << ": " << driver.lastError();
        EXPECT_TRUE(driver.read(*tag).has_value()) << uri << ": " << driver.lastError();
        EXPECT_EQ(codeIn(row[2]), driver.sent()) << uri;
        EXPECT_EQ(row[3] != "never", driver.write(*tag)) << uri << ": " << driver.lastError();
        EXPECT_EQ(codeIn(row[3]), driver.sent()) << uri;
    }
}

/// An area, and the addresses that the page gives it.
struct Area {
    std::string name;
    std::vector<Range> ranges;
};

std::vector<Area> areasOf(const std::string& model) {
    const bool zeroBased = model == "2" || model == "4";
    std::vector<Area> areas;
    for (const Row& row : page().table("## Areas and their ranges"))
        for (const std::string& name : codeIn(row.at(0)))
            areas.push_back({name, rangesIn(row.at(zeroBased ? 3 : 2))});
    return areas;
}

/// The first and the last address of each range, and what lies beside them.
std::vector<int> edgesOf(const Area& area) {
    std::vector<int> edges;
    for (const auto& [first, last] : area.ranges)
        for (const int number : {first - 1, first, last, last + 1})
            edges.push_back(number);
    return edges;
}

std::string refusalAt(const std::string& model, const Area& area, int number) {
    if (area.name == "LONG" && (model == "1" || model == "2")) return "Can't access memory type";
    return contains(area.ranges, number) ? "" : "invalid offset for this memory type";
}

TEST(TagUriPageTest, RangesEndWhereTheDriverEndsThem) {
    for (const char* const model : {"1", "2", "3", "4"}) {
        DriverOfThePage driver(model);
        for (const Area& area : areasOf(model)) {
            ASSERT_FALSE(area.ranges.empty()) << area.name;
            for (const int number : edgesOf(area)) {
                const std::string uri =
                    "1?" + area.name + '?' + std::to_string(number) + '?' + typeFor(area.name);
                EXPECT_EQ(refusalAt(model, area, number), driver.refusalOf(uri))
                    << uri << " in model " << model;
            }
        }
    }
}

/// The areas that a cell of the type table names for `type`.
bool accepts(const std::string& cell, const std::string& type, const std::string& area) {
    const std::size_t extra = cell.find(';');
    const auto names = [&area](const std::string& list) {
        return (' ' + list + ',').find(' ' + area + ',') != std::string::npos;
    };
    if (names(cell.substr(0, extra))) return true;
    if (extra == std::string::npos) return false;
    const std::string rest = cell.substr(extra + 1);
    const std::size_t also = rest.find("also");
    return onlyCodeIn(rest) == type && names(rest.substr(also + 5));
}

/// A type as a tag names it, arrays with two items, and what the page says of it.
struct Type {
    std::string name;
    int bytes;
    std::vector<std::string> areas;
};

Type typeOf(const Row& row, const std::string& written) {
    Type type{written, static_cast<int>(std::strtol(row.at(1).c_str(), nullptr, 10)), {}};
    if (written.ends_with("-N")) {
        type.name.back() = '2';
        type.bytes = 2 * std::max(type.bytes, 1);
    }
    for (const Area& area : areasOf("3"))
        if (accepts(row.at(2), written, area.name)) type.areas.push_back(area.name);
    return type;
}

std::vector<Type> typesOfThePage() {
    std::vector<Type> types;
    for (const Row& row : page().table("## Types"))
        for (const std::string& written : codeIn(row.at(0)))
            types.push_back(typeOf(row, written));
    return types;
}

/// The areas in which the driver makes a tag of the type; each has the length that the page says.
std::vector<std::string> areasThatTake(DriverOfThePage& driver, const Type& type) {
    std::vector<std::string> areas;
    for (const Area& area : areasOf("3")) {
        const std::string first = std::to_string(area.ranges.front().first);
        const ITag* const tag = driver.create("1?" + area.name + '?' + first + '?' + type.name);
        if (tag == nullptr) continue;
        areas.push_back(area.name);
        EXPECT_EQ(type.bytes, tag->GetVarLength()) << tag->GetVarName();
    }
    return areas;
}

TEST(TagUriPageTest, TypesHaveTheirLengthAndTheirAreas) {
    DriverOfThePage driver("3");
    const std::vector<Type> types = typesOfThePage();
    EXPECT_EQ(27U, types.size());
    for (const Type& type : types)
        EXPECT_EQ(type.areas, areasThatTake(driver, type)) << type.name;
}

TEST(TagUriPageTest, ValuesAreWhatTheirExamplesSay) {
    DriverOfThePage driver("1");
    for (const Row& row : page().table("### Examples of values")) {
        driver.hold(hex(onlyCodeIn(row.at(0))));
        const std::string uri = onlyCodeIn(row.at(1));
        const ITag* const tag = driver.create(uri);
        ASSERT_NE(nullptr, tag) << uri << ": " << driver.lastError();
        const auto value = driver.read(*tag);
        ASSERT_TRUE(value.has_value()) << uri << ": " << driver.lastError();
        EXPECT_EQ(onlyCodeIn(row.at(2)), toHex(*value)) << uri;
    }
}

TEST(TagUriPageTest, ConversionsOfTheTableExistAndHaveAnExample) {
    DriverOfThePage driver("1");
    for (const Row& row : page().table("## Conversions")) {
        const std::string name = onlyCodeIn(row.at(0));
        bool shown = false;
        for (const Row& example : page().table("### Examples of values"))
            shown = shown || example.at(1).find(name) != std::string::npos;
        EXPECT_TRUE(shown) << name;
    }
    const ITag* const tag = driver.create("1?HREG?400001?short(swap3)");
    ASSERT_NE(nullptr, tag);
    EXPECT_FALSE(driver.read(*tag).has_value());
    EXPECT_EQ("read conversion error", driver.lastError());
}

/// The tags of a refusal's row, with what is wrong.
std::vector<std::string> examplesOf(const Row& row, std::size_t column) {
    std::vector<std::string> uris{onlyCodeIn(row.at(column))};
    if (!row.at(column + 1).empty()) uris.push_back(onlyCodeIn(row.at(column + 1)));
    return uris;
}

TEST(TagUriPageTest, CreationIsRefusedInTheOrderOfTheTable) {
    DriverOfThePage driver("1");
    for (const Row& row : page().table("## When the tag is created"))
        for (const std::string& uri : examplesOf(row, 1))
            EXPECT_EQ(row[0], driver.refusalOf(uri)) << uri;
}

TEST(TagUriPageTest, ReadsAreRefusedInTheOrderOfTheTable) {
    DriverOfThePage driver("1");
    for (const Row& row : page().table("## When it is read")) {
        for (const std::string& uri : examplesOf(row, 2)) {
            const ITag* const tag = driver.create(uri);
            ASSERT_NE(nullptr, tag) << uri << ": " << driver.lastError();
            EXPECT_FALSE(driver.read(*tag).has_value()) << uri;
            EXPECT_EQ(row[1], driver.lastError()) << uri;
            EXPECT_EQ(std::stoi(row[0]), driver.code()) << uri;
        }
    }
}

TEST(TagUriPageTest, WritesAreRefusedInTheOrderOfTheTable) {
    DriverOfThePage driver("1");
    for (const Row& row : page().table("## When it is written")) {
        for (const std::string& uri : examplesOf(row, 2)) {
            const ITag* const tag = driver.create(uri);
            ASSERT_NE(nullptr, tag) << uri << ": " << driver.lastError();
            EXPECT_FALSE(driver.write(*tag)) << uri;
            EXPECT_EQ(row[1], driver.lastError()) << uri;
            EXPECT_EQ(std::stoi(row[0]), driver.code()) << uri;
            EXPECT_EQ(Texts{}, driver.sent()) << uri;
        }
    }
}

}  // namespace
}  // namespace docs_test
