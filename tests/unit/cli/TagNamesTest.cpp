// Lists of tags on the command line: names for URIs, values in units.
#include <gtest/gtest.h>

#include <algorithm>
#include <nlohmann/json.hpp>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;

const std::string kExample = SOURCE_FOLDER "/examples/tags.csv";

std::string listOf(const std::string& text) {
    std::string file = cli_test::scratchFile("tags.csv");
    cli_test::writeFile(file, text);
    return file;
}

TEST(TagNamesTest, ReadTakesNamesAndUrisInTheOrderOfTheLine) {
    const Outcome outcome =
        mrtu({"read", "--sim", "--tags", kExample, "flow", "1?HREG?400001?short", "supply"});
    EXPECT_EQ("flow = 320.00 m³/h\n1?HREG?400001?short = 1000\nsupply = 60.0 °C\n", outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

// The energy is registers 1009 and 1010, the high one first: 1009 x 65536 + 1010.
TEST(TagNamesTest, ReadWithoutNamesReadsTheWholeList) {
    const Outcome outcome = mrtu({"read", "--sim", "--tags", kExample});
    EXPECT_EQ(
        "supply = 60.0 °C\nsetpoint = 101.9 °C\nenergy = 66126.834 MWh\nburner = 0\n"
        "flow = 320.00 m³/h\n",
        outcome.out);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(TagNamesTest, ReadTellsScaledAndRawValuesInJson) {
    const Outcome outcome =
        mrtu({"read", "--sim", "--json", "--tags", kExample, "supply", "burner"});
    EXPECT_EQ(
        "[\n"
        R"(  {"uri":"1?HREG?400001?short","name":"supply","type":"short","value":60.0,"raw":1000,)"
        R"("unit":"°C"},)"
        "\n"
        R"(  {"uri":"1?INP?100003?boolean","name":"burner","type":"boolean","value":false})"
        "\n]\n",
        outcome.out);
}

TEST(TagNamesTest, FailuresHaveTheNameAndLeaveTheOthersAlone) {
    const std::string file =
        listOf("name,uri\ngone,1?HREG?410001?short\nthere,1?HREG?400001?short\n");
    const Outcome lines = mrtu({"read", "--sim", "--tags", file});
    EXPECT_EQ("there = 1000\n", lines.out);
    EXPECT_EQ("mrtu: gone: error -6: Exception: Illegal data address\n", lines.err);
    EXPECT_EQ(5, lines.exitCode);
    const auto json = nlohmann::json::parse(mrtu({"read", "--sim", "--json", "--tags", file}).out);
    EXPECT_EQ("gone", json[0]["name"]);
    EXPECT_EQ(-6, json[0]["error"]["code"]);
}

TEST(TagNamesTest, UnknownNamesAreAllToldBeforeAnythingIsAsked) {
    const Outcome outcome =
        mrtu({"read", "--port", "/nowhere", "--tags", kExample, "suply", "flow", "level"});
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ("mrtu: no tag 'suply' in " + kExample + "; 'supply' perhaps\n" +
                  "mrtu: no tag 'level' in " + kExample + "\nmrtu: nothing was done\n",
              outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(TagNamesTest, APlainListIsReadByItsUris) {
    const std::string file = listOf("# two\n1?HREG?400001?short\n1?OUTP?3?boolean  # lamp\n");
    const Outcome outcome = mrtu({"read", "--sim", "--tags", file});
    EXPECT_EQ("1?HREG?400001?short = 1000\n1?OUTP?3?boolean = 1\n", outcome.out);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(TagNamesTest, AListWithMistakesIsNotUsed) {
    const std::string file = listOf("name,uri,scale\na,1?HREG?400001?short,\"0,1\"\na,b\n");
    const Outcome outcome = mrtu({"read", "--sim", "--tags", file, "a"});
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ("mrtu: " + file +
                  ":2:23: '0,1' has a decimal comma: expected a number with a decimal point, 0.1\n"
                  "mrtu: " +
                  file + ":3:3: 2 fields: expected 3 as in the header line\nmrtu: " + file +
                  ": the list is not used\n",
              outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

TEST(TagNamesTest, OfManyMistakesTheFirstTwentyAreTold) {
    std::string text = "name,uri\n";
    for (int i = 0; i < 30; ++i)
        text += ",u\n";
    const std::string file = listOf(text);
    const Outcome outcome = mrtu({"read", "--sim", "--tags", file});
    EXPECT_NE(std::string::npos, outcome.err.find(file + ":21:1: no name"));
    EXPECT_EQ(std::string::npos, outcome.err.find(file + ":22:1: no name"));
    EXPECT_TRUE(outcome.err.ends_with(": 10 more; the list is not used\n")) << outcome.err;
}

TEST(TagNamesTest, FilesThatCannotBeReadAndEmptyListsAreWrongUsage) {
    const Outcome missing = mrtu({"read", "--sim", "--tags", "/nowhere/tags.csv"});
    EXPECT_EQ("mrtu: tags /nowhere/tags.csv: No such file or directory\n", missing.err);
    EXPECT_EQ(2, missing.exitCode);
    const Outcome empty = mrtu({"read", "--sim", "--tags", listOf("# nothing\n")});
    EXPECT_NE(std::string::npos, empty.err.find(":1:1: no tag: expected a header line"));
    EXPECT_EQ(2, empty.exitCode);
}

TEST(TagNamesTest, WriteTakesValuesInTheUnitOfTheList) {
    const Outcome outcome = mrtu({"write", "--sim", "--verify", "--json", "--tags", kExample,
                                  "setpoint=21.54", "1?HREG?400030?short=7"});
    EXPECT_EQ(
        "[\n"
        R"(  {"uri":"1?HREG?400020?short","name":"setpoint","type":"short","value":21.5,"raw":215,)"
        R"("unit":"°C"},)"
        "\n"
        R"(  {"uri":"1?HREG?400030?short","type":"short","value":7})"
        "\n]\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(0, outcome.exitCode);
}

TEST(TagNamesTest, WriteRefusesWhatTheTagOrTheListDoesNotTake) {
    const std::string file = listOf(
        "name,uri,scale,low,high\nset,1?HREG?400020?short,0.1,20,90\nwide,1?HREG?400021?short,0.1,,"
        "\nlamp,1?OUTP?1?boolean,10,,\n");
    const Outcome outcome =
        mrtu({"write", "--sim", "--tags", file, "set=19.9", "wide=5000", "lamp=10", "sett=20"});
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(
        "mrtu: set: '19.9' is below the tag's low limit 20\n"
        "mrtu: wide: '5000' as the device has it: '50000' is out of range for short "
        "(-32768..32767)\n"
        "mrtu: lamp: '10' is none of 0, 1, false and true (boolean)\n"
        "mrtu: no tag 'sett' in " +
            file + "; 'set' perhaps\nmrtu: nothing was sent\n",
        outcome.err);
    EXPECT_EQ(2, outcome.exitCode);
}

/// The words of a typed line: blanks separate them but within single quotes.
std::vector<std::string> wordsOf(const std::string& line) {
    std::vector<std::string> words{""};
    bool quoted = false;
    for (const char each : line) {
        if (each == '\'') {
            quoted = !quoted;
        } else if (each == ' ' && !quoted) {
            words.emplace_back();
        } else {
            words.back() += each;
        }
    }
    return words;
}

/// @return the text as the page has it, which calls files by shorter names.
std::string replaced(std::string text, const std::string& what, const std::string& with) {
    for (std::size_t at = text.find(what); at != std::string::npos;
         at = text.find(what, at + with.size()))
        text.replace(at, what.size(), with);
    return text;
}

/// What follows a line of the page, up to the next one typed or the end of the transcript.
std::string shownBelow(const std::string& page, const std::string& line) {
    const std::size_t begin = page.find(line + '\n') + line.size() + 1;
    return page.substr(
        begin, std::min(page.find("\n$ ", begin - 1), page.find("\n```", begin - 1)) - begin + 1);
}

TEST(TagNamesTest, ThePageShowsTheRealOutput) {
    const std::string page = cli_test::contentsOf(SOURCE_FOLDER "/docs/tag-list.md");
    const std::string bad = listOf(shownBelow(page, "$ cat bad.csv"));
    EXPECT_NE(std::string::npos, page.find(cli_test::contentsOf(kExample)));
    int typed = 0;
    for (std::size_t at = page.find("\n$ mrtu "); at != std::string::npos;
         at = page.find("\n$ mrtu ", at + 1)) {
        const std::string line = page.substr(at + 1, page.find('\n', at + 1) - at - 1);
        std::vector<std::string> words =
            wordsOf(replaced(replaced(line, "examples/tags.csv", kExample), "bad.csv", bad));
        words.erase(words.begin(), words.begin() + 2);
        const Outcome outcome = mrtu(words);
        EXPECT_EQ(shownBelow(page, line),
                  replaced(replaced(outcome.out + outcome.err, kExample, "examples/tags.csv"), bad,
                           "bad.csv"));
        ++typed;
    }
    EXPECT_EQ(6, typed);
}

}  // namespace
