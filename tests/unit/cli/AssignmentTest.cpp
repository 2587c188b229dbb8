#include "cli/Assignment.h"

#include <gtest/gtest.h>

#include "cli/ExitCode.h"

namespace {

TEST(Assignment, IsSplitAtTheFirstEqualsSign) {
    const auto split = cli::parseAssignment("1?HREG?400001?string-8=a=b");
    EXPECT_EQ(split.uri, "1?HREG?400001?string-8");
    EXPECT_EQ(split.value, "a=b");
    EXPECT_EQ(cli::parseAssignment("u=").value, "");
}

TEST(Assignment, NeedsUriAndEqualsSign) {
    for (const char* const text : {"", "1?HREG?400001?int", "=5", "="}) {
        EXPECT_THROW(cli::parseAssignment(text), cli::CommandError) << text;
    }
}

TEST(ExitCode, FollowsTheDriversErrorCode) {
    EXPECT_EQ(cli::exitCodeOf(-4), cli::ExitCode::NoResponse);
    EXPECT_EQ(cli::exitCodeOf(-6), cli::ExitCode::BadReply);
    for (const int other : {-1, -3, -9, -10, 0, 1}) {
        EXPECT_EQ(cli::exitCodeOf(other), cli::ExitCode::Other) << other;
    }
}

TEST(ExitCode, OfSeveralFailuresTheFirstCounts) {
    cli::FirstFailure first;
    EXPECT_EQ(first.code(), cli::ExitCode::Done);
    first.note(cli::ExitCode::NoResponse);
    first.note(cli::ExitCode::BadReply);
    EXPECT_EQ(first.code(), cli::ExitCode::NoResponse);
}

}  // namespace
