// Loading a library runs its start-up code: the warning comes first. A suite of this ending runs
// before all others, while its process has one thread.
#include <gtest/gtest.h>

#include <iostream>

#include "tests/unit/cli/InProcess.h"

namespace cli {
namespace {

TEST(InspectCommandDeathTest, LoadingIsAnnouncedBeforeItHappens) {
    const char* const words[] = {"mrtu", "inspect", "--load", DEADLY_PLUGIN};
    EXPECT_EXIT(runCommandLine(4, words, std::cout, std::cerr), testing::ExitedWithCode(99),
                "^mrtu: loading .*: its start-up code runs now\n$");
}

}  // namespace
}  // namespace cli
