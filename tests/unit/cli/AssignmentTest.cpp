#include "cli/Assignment.h"

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

TEST(AssignmentTest, ExitCodeFollowsTheDriversErrorCode) {
    EXPECT_EQ(cli::ExitCode::NoResponse, cli::exitCodeOf(-4));
    EXPECT_EQ(cli::ExitCode::BadReply, cli::exitCodeOf(-6));
    for (const int other : {-1, -3, -9, -10, 0, 1}) {
        EXPECT_EQ(cli::ExitCode::Other, cli::exitCodeOf(other)) << other;
    }
}

TEST(AssignmentTest, ExitCodeOfSeveralFailuresTheFirstCounts) {
    cli::FirstFailure first;
    EXPECT_EQ(cli::ExitCode::Done, first.code());
    first.note(cli::ExitCode::NoResponse);
    first.note(cli::ExitCode::BadReply);
    EXPECT_EQ(cli::ExitCode::NoResponse, first.code());
}

}  // namespace
