#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "SampleProgram.h"

using cli::manual::Command;
using cli::manual::Option;
using testing::ElementsAre;
using testing::IsEmpty;

namespace manual_test {
namespace {

const Option& optionOf(const Command& command, const std::string& name) {
    for (const Option& option : command.options)
        for (const std::string& each : option.names)
            if (each == name) return option;
    throw std::logic_error("no such option: " + name);
}

TEST(ManualDescribeTest, CommandsStandInTheOrderOfTheirDeclaration) {
    const Command program = sampleProgram();
    std::vector<std::string> paths;
    for (const Command* each : withSubcommands(program))
        paths.push_back(each->path());
    EXPECT_THAT(paths, ElementsAre("", "fetch", "store", "store set", "store list"));
}

TEST(ManualDescribeTest, AFlagTakesNoValue) {
    const Command program = sampleProgram();
    const Option& quiet = optionOf(commandOf(program, "fetch"), "--quiet");
    EXPECT_FALSE(quiet.takesValue());
    EXPECT_THAT(quiet.names, ElementsAre("-q", "--quiet"));
}

TEST(ManualDescribeTest, ChoicesAreThoseThatTheOptionTakes) {
    const Command program = sampleProgram();
    EXPECT_THAT(optionOf(commandOf(program, "fetch"), "--colour").choices,
                ElementsAre("red", "blue"));
    EXPECT_THAT(optionOf(commandOf(program, "fetch"), "--file").choices, IsEmpty());
}

TEST(ManualDescribeTest, FilesAreKnownByTheNameOfTheValue) {
    const Command program = sampleProgram();
    EXPECT_TRUE(optionOf(commandOf(program, "fetch"), "--file").takesFile());
    EXPECT_FALSE(optionOf(commandOf(program, "fetch"), "--parity").takesFile());
}

TEST(ManualDescribeTest, PositionalsSayWhetherTheyAreNeededAndRepeated) {
    const Command program = sampleProgram();
    const Command& fetch = commandOf(program, "fetch");
    ASSERT_EQ(1U, fetch.positionals.size());
    EXPECT_THAT(fetch.positionals[0].names, ElementsAre("URI"));
    EXPECT_TRUE(fetch.positionals[0].required);
    EXPECT_TRUE(fetch.positionals[0].repeated);
}

TEST(ManualDescribeTest, TheTextUnderTheOptionsIsCutAtItsTitles) {
    const Command program = sampleProgram();
    const Command& fetch = commandOf(program, "fetch");
    ASSERT_EQ(2U, fetch.sections.size());
    EXPECT_EQ("", fetch.sections[0].title);
    EXPECT_THAT(fetch.sections[0].lines, ElementsAre("Reads on.", ""));
    EXPECT_EQ("Examples", fetch.sections[1].title);
    EXPECT_THAT(commandOf(program, "store").sections, IsEmpty());
}

}  // namespace
}  // namespace manual_test
