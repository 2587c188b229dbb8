// What the scripts hold; that shells obey them is the affair of the script "completions".
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "SampleProgram.h"

using testing::HasSubstr;
using testing::Not;

namespace manual_test {
namespace {

TEST(CompletionTest, TextsAreQuotedForTheShells) {
    EXPECT_EQ("'it'\\''s $5'", cli::manual::shellQuoted("it's $5"));
}

TEST(CompletionTest, NoScriptTellsOfWhatIsHidden) {
    const auto program = sampleProgram();
    for (const std::string& script :
         {cli::manual::bashCompletion(program), cli::manual::zshCompletion(program),
          cli::manual::fishCompletion(program)}) {
        EXPECT_THAT(script, HasSubstr("fetch"));
        EXPECT_THAT(script, Not(HasSubstr("hidden")));
        EXPECT_THAT(script, Not(HasSubstr("secret")));
    }
}

TEST(CompletionTest, BashKnowsTheChoicesOfAnOption) {
    EXPECT_THAT(cli::manual::bashCompletion(sampleProgram()),
                HasSubstr("'fetch --parity') words='none even odd' ;;\n"));
}

TEST(CompletionTest, ZshTextsCannotEndTheirEntry) {
    EXPECT_THAT(cli::manual::zshCompletion(sampleProgram()),
                HasSubstr("'--file=[Where\\: a path]:FILE:_files'"));
    EXPECT_THAT(cli::manual::zshCompletion(sampleProgram()),
                HasSubstr("'fetch:Fetch it'\\''s [all]'"));
}

TEST(CompletionTest, FishTellsCommandsOfTheSameNameApart) {
    EXPECT_THAT(
        cli::manual::fishCompletion(sampleProgram()),
        HasSubstr("complete -c tool -n 'test (__tool_command) = \"store set\"' -l file -r -F"));
}

}  // namespace
}  // namespace manual_test
