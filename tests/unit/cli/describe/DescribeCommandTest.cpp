// The sub-command against the real plug-in.
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <sstream>
#include <utility>
#include <vector>

#include "tests/unit/cli/InProcess.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

Outcome describe(std::vector<std::string> words) {
    words.insert(words.begin(), "describe");
    words.insert(words.end(), {"--plugin", PLUGIN});
    return runInProcess(std::move(words));
}

std::string contentsOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// The text as Markdown shows it verbatim.
std::string asShown(const std::string& text) {
    std::istringstream lines(text);
    std::string shown;
    for (std::string line; std::getline(lines, line);)
        shown.append("    ").append(line) += '\n';
    return shown;
}

TEST(DescribeCommandTest, DocumentationShowsTheRealOutput) {
    const std::string page = contentsOf(SOURCE_FOLDER "/docs/description.md");
    for (const char* section : {"parameters", "memory", "conversions"}) {
        const std::string shown = asShown(describe({section}).out);
        EXPECT_GT(shown.size(), 100U) << section;
        EXPECT_NE(page.find(shown), std::string::npos) << shown;
    }
}

TEST(DescribeCommandTest, XmlIsTheDocumentByteForByte) {
    const std::string document = contentsOf(SOURCE_FOLDER "/description/mrtu.xml");
    ASSERT_FALSE(document.empty());
    const Outcome outcome = describe({"--xml"});
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ(document, outcome.out);
}

TEST(DescribeCommandTest, SectionsAreFoundInTheWhole) {
    const Outcome whole = describe({});
    ASSERT_EQ(0, whole.code) << whole.err;
    for (const char* section : {"models", "memory", "parameters", "conversions"}) {
        const Outcome part = describe({section});
        EXPECT_EQ(0, part.code) << section;
        EXPECT_FALSE(part.out.empty()) << section;
        EXPECT_NE(whole.out.find(part.out), std::string::npos) << section;
    }
}

TEST(DescribeCommandTest, JsonHoldsEverySection) {
    const Json json = Json::parse(describe({"--json"}).out);
    EXPECT_EQ("MRTU", json["facts"]["name"]);
    EXPECT_EQ(18U, json["parameters"].size());
    EXPECT_EQ(12U, json["memory"].size());
    EXPECT_EQ(4U, json["tagFields"].size());
    EXPECT_EQ(4U, json["models"].size());
    EXPECT_EQ(7U, json["conversions"].size());
    EXPECT_EQ(json["models"], Json::parse(describe({"models", "--json"}).out));
}

TEST(DescribeCommandTest, WrongUsageIsRefused) {
    EXPECT_EQ(2, describe({"--xml", "--json"}).code);
    EXPECT_EQ(2, describe({"--xml", "models"}).code);
    EXPECT_EQ(2, describe({"weather"}).code);
}

TEST(DescribeCommandTest, UnknownProtocolIsSaidToBeUnknown) {
    const Outcome outcome = describe({"--protocol", "XYZ"});
    EXPECT_EQ(1, outcome.code);
    EXPECT_NE(outcome.err.find("XYZ"), std::string::npos) << outcome.err;
}

}  // namespace
}  // namespace cli
