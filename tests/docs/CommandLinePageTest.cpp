// docs/command-line.md against what `--help` knows of commands and options.
#include <gtest/gtest.h>

#include <iostream>
#include <map>
#include <regex>
#include <set>
#include <sstream>

#include "cli/Command.h"
#include "cli/manual/Manual.h"
#include "tests/docs/Page.h"

namespace docs_test {
namespace {

using Names = std::set<std::string>;

/// Of each option, the commands that have it; "mrtu" is the program itself. Commands below another
/// one count as that one.
using Options = std::map<std::string, Names>;

const cli::manual::Command& program() {
    static cli::CommandContext context{
        .out = std::cout, .err = std::cerr, .exitCode = cli::ExitCode::Done, .pluginOption = {}};
    static const cli::manual::Command declared = cli::manual::describe(cli::commandLine(context));
    return declared;
}

const Page& page() {
    static const Page read("docs/command-line.md");
    return read;
}

std::vector<std::string> commandsOfTheHelp() {
    std::vector<std::string> names;
    for (const cli::manual::Command& command : program().commands)
        names.push_back(command.path());
    return names;
}

Options optionsOfTheHelp() {
    Options options;
    for (const cli::manual::Command* command : withSubcommands(program()))
        for (const cli::manual::Option& option : command->options)
            for (const std::string& name : option.names)
                options[name].insert(command->words.at(command->words.size() > 1 ? 1 : 0));
    return options;
}

Names commandsOfCell(const std::string& cell) {
    const std::vector<std::string> all = commandsOfTheHelp();
    Names commands;
    if (cell == "all") commands = {all.begin(), all.end()};
    if (cell == "all") commands.insert("mrtu");
    if (cell.starts_with("line commands"))
        commands = {"read", "write", "console", "override", "poll"};
    for (const std::string& name : codeIn(cell))
        commands.insert(name);
    return commands;
}

Options optionsOfThePage() {
    Options options;
    std::vector<std::string> names;
    for (const Row& row : page().table("## Options")) {
        // An empty cell goes on with the option above.
        if (!row.at(0).empty()) names = codeIn(row[0]);
        for (const std::string& name : names)
            options[name].merge(commandsOfCell(row.at(1)));
    }
    return options;
}

/// The commands of a page's table of commands, in its order.
std::vector<std::string> commandsOf(const Page& page, const std::string& heading) {
    std::vector<std::string> names;
    for (const Row& row : page.table(heading))
        names.push_back(onlyCodeIn(row.at(0)));
    return names;
}

/// The lines of the page's transcripts in which a command is typed, with the lines they go on in.
std::vector<std::string> typedLines() {
    std::vector<std::string> typed;
    std::istringstream lines(page().text());
    bool goesOn = false;
    for (std::string line; std::getline(lines, line);) {
        if (goesOn) typed.back() += line;
        if (line.starts_with("$ mrtu ")) typed.push_back(line);
        goesOn = (goesOn || line.starts_with("$ mrtu ")) && line.ends_with('\\');
    }
    return typed;
}

Names optionsIn(const std::string& text) {
    static const std::regex option("(^|[ `])(--[a-z][a-z-]*)");
    Names names;
    for (std::sregex_iterator each(text.begin(), text.end(), option), end; each != end; ++each)
        names.insert((*each)[2]);
    return names;
}

TEST(CommandLinePageTest, CommandsAreThoseOfTheHelpInItsOrder) {
    EXPECT_EQ(commandsOfTheHelp(), commandsOf(page(), "# The command `mrtu`"));
}

TEST(CommandLinePageTest, TheReadmeNamesTheSameCommands) {
    EXPECT_EQ(commandsOfTheHelp(), commandsOf(Page("README.md"), "## The command"));
}

TEST(CommandLinePageTest, OptionsAndTheirCommandsAreThoseOfTheHelp) {
    const Options expected = optionsOfTheHelp();
    const Options told = optionsOfThePage();
    for (const auto& [name, commands] : expected) {
        ASSERT_TRUE(told.contains(name)) << name << " is missing";
        EXPECT_EQ(commands, told.at(name)) << name;
    }
    for (const auto& [name, commands] : told)
        EXPECT_TRUE(expected.contains(name)) << "there is no " << name;
}

TEST(CommandLinePageTest, TextsSpeakOfNoOtherOptions) {
    const Options expected = optionsOfTheHelp();
    for (const std::string& name : optionsIn(page().text()))
        EXPECT_TRUE(expected.contains(name)) << "there is no " << name;
}

TEST(CommandLinePageTest, TypedCommandsHaveTheOptionsThatTheyAreGiven) {
    const Options expected = optionsOfTheHelp();
    const std::vector<std::string> lines = typedLines();
    EXPECT_LT(10U, lines.size());
    for (const std::string& line : lines) {
        std::string dollar;
        std::string mrtu;
        std::string command;
        std::istringstream(line) >> dollar >> mrtu >> command;
        for (const std::string& name : optionsIn(line)) {
            ASSERT_TRUE(expected.contains(name)) << line;
            EXPECT_TRUE(expected.at(name).contains(command)) << name << " in: " << line;
        }
    }
}

}  // namespace
}  // namespace docs_test
