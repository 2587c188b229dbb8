#include "cli/write/Assignment.h"

#include <gtest/gtest.h>

#include "cli/ExitCode.h"

namespace {

TEST(AssignmentTest, IsSplitAtTheFirstEqualsSign) {
    const auto split = cli::parseAssignment("1?HREG?400001?string-8=a=b");
    EXPECT_EQ("1?HREG?400001?string-8", split.uri);
    EXPECT_EQ("a=b", split.value);
    EXPECT_EQ("", cli::parseAssignment("u=").value);
}

TEST(AssignmentTest, NeedsUriAndEqualsSign) {
    for (const char* const text : {"", "1?HREG?400001?int", "=5", "="}) {
        EXPECT_THROW(cli::parseAssignment(text), cli::CommandError) << text;
    }
}

}  // namespace
