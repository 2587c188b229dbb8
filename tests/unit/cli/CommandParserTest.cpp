#include "cli/CommandParser.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/// A program with one of everything, and what a line sets in it.
struct Program {
    bool quiet = false;
    int number = 7;
    std::string text;
    std::vector<int> numbers;
    std::vector<std::string> files;
    cli::CommandSpec spec{
        .name = "tool",
        .summary = "Does things.",
        .footer = "The end.",
        .version = "tool 1.2",
        .commands = {
            {.name = "get",
             .summary = "Get it",
             .options =
                 {{.names = "-q,--quiet", .target = &quiet, .help = "Say nothing"},
                  {.names = "--number",
                   .target = &number,
                   .help = "How many",
                   .range = cli::NumberRange{1, 9},
                   .showsDefault = true},
                  {.names = "--colour",
                   .target = &text,
                   .help = "Which",
                   .choices = {"red", "blue"},
                   .excludes = {"--quiet"}},
                  {.names = "--node", .target = &numbers, .help = "Who", .oneWordEach = true},
                  {.names = "FILE", .target = &files, .help = "From where", .required = true}}},
            {.name = "keep",
             .summary = "Keep it",
             .commands = {{.name = "all", .summary = "All"}},
             .needsCommand = true}}};

    cli::ParsedLine parse(const std::vector<std::string>& words) {
        return cli::parseCommandLine(spec, words);
    }
    std::string answer(const std::vector<std::string>& words) {
        return std::get<cli::Answered>(parse(words)).text;
    }
    cli::Refused refusal(const std::vector<std::string>& words) {
        return std::get<cli::Refused>(parse(words));
    }
};

std::vector<std::string> namesOf(const cli::CommandPath& path) {
    std::vector<std::string> names;
    for (const cli::CommandSpec* command : path)
        names.push_back(command->name);
    return names;
}

std::vector<std::string> accepted(const cli::ParsedLine& line) {
    return namesOf(std::get<cli::Accepted>(line).path);
}

TEST(CommandParserTest, ALineNamesItsCommandFromTheProgramDown) {
    Program program;
    EXPECT_THAT(accepted(program.parse({})), ElementsAre("tool"));
    EXPECT_THAT(accepted(program.parse({"get", "a"})), ElementsAre("tool", "get"));
    EXPECT_THAT(accepted(program.parse({"keep", "all"})), ElementsAre("tool", "keep", "all"));
}

TEST(CommandParserTest, TargetsReceiveTheirWords) {
    Program program;
    accepted(program.parse({"get", "-q", "--number", "3", "--node=4", "--node", "5", "a", "b"}));
    EXPECT_TRUE(program.quiet);
    EXPECT_EQ(3, program.number);
    EXPECT_THAT(program.numbers, ElementsAre(4, 5));
    EXPECT_THAT(program.files, ElementsAre("a", "b"));
}

TEST(CommandParserTest, AChoiceIsStoredAsItIsDeclared) {
    Program program;
    accepted(program.parse({"get", "--colour", "BLUE", "a"}));
    EXPECT_EQ("blue", program.text);
}

TEST(CommandParserTest, HelpAndVersionAreAnswered) {
    Program program;
    EXPECT_EQ("tool 1.2\n", program.answer({"--version"}));
    EXPECT_THAT(program.answer({"--help"}), HasSubstr("get                         Get it"));
    const std::string help = program.answer({"get", "--help"});
    for (const char* const text : {"-q,--quiet", "INT:INT in [1 - 9]=7", "Excludes: --quiet",
                                   "FILE TEXT ... REQUIRED", "-h,--help", "The end."})
        EXPECT_THAT(help, HasSubstr(text));
}

TEST(CommandParserTest, AStrayWordIsToldWithTheCommandThatDidNotTakeIt) {
    Program program;
    const cli::Refused option = program.refusal({"get", "a", "--qiet"});
    EXPECT_THAT(namesOf(option.path), ElementsAre("tool", "get"));
    EXPECT_EQ("--qiet", option.strayWord);
    const cli::Refused command = program.refusal({"gte"});
    EXPECT_THAT(namesOf(command.path), ElementsAre("tool"));
    EXPECT_EQ("gte", command.strayWord);
    EXPECT_FALSE(command.commandNamed);
}

TEST(CommandParserTest, AnEmptyWordIsAStrayWordToo) {
    Program program;
    EXPECT_EQ("", program.refusal({"keep", "all", ""}).strayWord);
}

TEST(CommandParserTest, AWrongLineIsRefusedWithItsReason) {
    struct Row {
        std::vector<std::string> words;
        const char* reason;
    };
    const Row rows[] = {
        {{"get"}, "FILE is required"},
        {{"get", "a", "--number", "10"}, "--number: Value 10 not in range 1 to 9"},
        {{"get", "a", "--number", "x"}, "--number: Value x not in range 1 to 9"},
        {{"get", "a", "--colour", "green"}, "--colour: 'green' is not one of red, blue"},
        {{"get", "a", "--colour", "red", "-q"}, "--quiet excludes --colour"},
        {{"keep"}, "A subcommand is required"},
    };
    for (const Row& row : rows) {
        Program program;
        const cli::Refused refused = program.refusal(row.words);
        EXPECT_EQ(std::nullopt, refused.strayWord) << row.reason;
        EXPECT_EQ(row.reason, refused.reason);
        EXPECT_EQ(row.words.front(), refused.path.back()->name);
    }
}

}  // namespace
