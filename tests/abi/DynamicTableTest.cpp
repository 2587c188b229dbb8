// What the dynamic tables of the two libraries hold beside their own names.
#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "tests/abi/SymbolTable.h"

namespace {

class DynamicTableTest : public ::testing::TestWithParam<const char*> {};

TEST_P(DynamicTableTest, ShowsNothingOfTheCppRunTime) {
    for (const abi_test::Symbol& symbol : abi_test::symbolsOf(GetParam())) {
        if (symbol.kind == 'U' || symbol.kind == 'w') continue;
        for (const char* const part : {"std::", "__cxa", "__gnu_cxx", "__cxxabiv1", "operator "})
            EXPECT_FALSE(symbol.name.starts_with(part)) << symbol.kind << ' ' << symbol.name;
        EXPECT_EQ(std::string::npos,
                  symbol.name.substr(0, symbol.name.find_first_of("(<")).find(" std::"))
            << symbol.kind << ' ' << symbol.name;
    }
}

TEST_P(DynamicTableTest, HasNoUniqueSymbolThatWouldKeepTheLibraryLoaded) {
    const std::string command = std::string(READELF_PROGRAM) + " -W --dyn-syms " + GetParam();
    std::size_t functions = 0;
    for (const std::string& line : abi_test::linesOf(command)) {
        EXPECT_EQ(std::string::npos, line.find(" UNIQUE ")) << line;
        if (line.find(" FUNC ") != std::string::npos) ++functions;
    }
    EXPECT_GT(functions, 50U) << "the table was not read";
}

TEST_P(DynamicTableTest, MayBeUnloaded) {
    const std::string command = std::string(READELF_PROGRAM) + " -W -d " + GetParam();
    bool named = false;
    for (const std::string& line : abi_test::linesOf(command)) {
        EXPECT_EQ(std::string::npos, line.find("NODELETE")) << line;
        named = named || line.find("(NEEDED)") != std::string::npos;
    }
    EXPECT_TRUE(named) << "the section was not read";
}

#ifdef MRTU_FOR_PANELS
/// The C library of the year 2018 is 2.28.
bool isOldEnough(const std::string& version) {
    const std::string prefix = "GLIBC_2.";
    return !version.starts_with(prefix) || std::atoi(version.c_str() + prefix.size()) <= 28;
}
#endif

TEST_P(DynamicTableTest, LoadsOnAnOldPanel) {
#ifndef MRTU_FOR_PANELS
    GTEST_SKIP() << "this build is for the machine that made it";
#else
    for (const abi_test::Symbol& symbol : abi_test::symbolsOf(GetParam()))
        EXPECT_TRUE(isOldEnough(symbol.version)) << symbol.name << '@' << symbol.version;
    for (const std::string& line :
         abi_test::linesOf(std::string(READELF_PROGRAM) + " -W -d " + GetParam()))
        EXPECT_EQ(std::string::npos, line.find("libstdc++")) << line;
#endif
}

INSTANTIATE_TEST_SUITE_P(Libraries, DynamicTableTest, ::testing::Values(PLUGIN_PATH, ENGINE_PATH),
                         [](const auto& library) {
                             return library.index == 0 ? "Plugin" : "Engine";
                         });

}  // namespace
