#include "cli/ExitCode.h"

#include <gtest/gtest.h>

namespace {

TEST(ExitCodeTest, FollowsTheDriversErrorCode) {
    EXPECT_EQ(cli::ExitCode::NoResponse, cli::exitCodeOf(-4));
    EXPECT_EQ(cli::ExitCode::BadReply, cli::exitCodeOf(-6));
    for (const int other : {-1, -3, -9, -10, 0, 1}) {
        EXPECT_EQ(cli::ExitCode::Other, cli::exitCodeOf(other)) << other;
    }
}

TEST(ExitCodeTest, OfSeveralFailuresTheFirstCounts) {
    cli::FirstFailure first;
    EXPECT_EQ(cli::ExitCode::Done, first.code());
    first.note(cli::ExitCode::NoResponse);
    first.note(cli::ExitCode::BadReply);
    EXPECT_EQ(cli::ExitCode::NoResponse, first.code());
}

}  // namespace
