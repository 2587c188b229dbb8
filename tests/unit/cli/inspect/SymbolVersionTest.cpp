#include "cli/inspect/SymbolVersion.h"

#include <gtest/gtest.h>

namespace cli {
namespace {

TEST(SymbolVersionTest, ComparesByNumberAndIgnoresOtherVersions) {
    const struct {
        std::vector<std::string> versions;
        std::string newest;
    } cases[] = {
        {{}, ""},
        {{"GLIBC_2.4"}, "2.4"},
        {{"GLIBC_2.4", "GLIBC_2.17"}, "2.17"},
        {{"GLIBC_2.17", "GLIBC_2.4"}, "2.17"},
        {{"GLIBC_2.2", "GLIBC_2.2.5"}, "2.2.5"},
        {{"GLIBC_2.2.5", "GLIBC_2.3"}, "2.3"},
        {{"GLIBCXX_3.4.30", "CXXABI_1.3", "GCC_3.5"}, ""},
        {{"GLIBC_PRIVATE", "GLIBC_ABI_DT_RELR", "GLIBC_2.28"}, "2.28"},
        {{"GLIBC_", "GLIBC_2.", "GLIBC_2.x", "GLIBC_-1.2"}, ""},
    };
    for (const auto& [versions, newest] : cases)
        EXPECT_EQ(newest, newestGlibc(versions)) << ::testing::PrintToString(versions);
}

}  // namespace
}  // namespace cli
