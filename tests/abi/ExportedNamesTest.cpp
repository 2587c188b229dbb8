// The names that the two libraries show, held against a list: who adds or loses one sees it here.
// The lists hold for every architecture and every kind of build. To renew one after an intended
// change: run this program with MRTU_WRITE_NAMES=1 and look at the difference.
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <regex>
#include <set>
#include <string>

#include "tests/abi/SymbolTable.h"

namespace {

using Names = std::set<std::string>;

/// The same name on every architecture: 64 bits are a "long" or a "long long", and a span's "any
/// number of items" is the greatest size_t there is.
std::string withoutWordSize(const std::string& name) {
    static const std::regex longLong("long long");
    static const std::regex greatest("18446744073709551615ul|4294967295u");
    return std::regex_replace(std::regex_replace(name, longLong, "long"), greatest, "any");
}

/// Tables and type information are weak on one architecture and strong on the other.
bool belongsOnTheList(const abi_test::Symbol& symbol) {
    const bool isTable =
        symbol.name.starts_with("vtable for ") || symbol.name.starts_with("typeinfo ");
    return abi_test::isStrongDefinition(symbol) && !isTable;
}

Names shownBy(const std::string& library) {
    Names names;
    for (const abi_test::Symbol& symbol : abi_test::symbolsOf(library))
        if (belongsOnTheList(symbol)) names.insert(withoutWordSize(symbol.name));
    return names;
}

Names listedIn(const std::string& path) {
    Names names;
    std::ifstream file(path);
    EXPECT_TRUE(file.is_open()) << path;
    for (std::string line; std::getline(file, line);)
        if (!line.empty() && line.front() != '#') names.insert(line);
    return names;
}

void write(const std::string& path, const Names& names) {
    std::ofstream file(path);
    file << "# Exported names, demangled, weak ones left out. tests/abi/ExportedNamesTest.cpp\n";
    for (const std::string& name : names)
        file << name << '\n';
}

void compare(const std::string& library, const std::string& list) {
    const Names shown = shownBy(library);
    const std::string path = std::string(NAMES_DIRECTORY) + '/' + list;
    if (std::getenv("MRTU_WRITE_NAMES") != nullptr) write(path, shown);
    const Names listed = listedIn(path);
    for (const std::string& name : shown)
        EXPECT_TRUE(listed.contains(name)) << "not in " << list << ": " << name;
    for (const std::string& name : listed)
        EXPECT_TRUE(shown.contains(name)) << "no longer shown: " << name;
}

TEST(ExportedNamesTest, ThoseOfThePluginAreTheListedOnes) {
    compare(PLUGIN_PATH, "libmrtu.names");
}

TEST(ExportedNamesTest, ThoseOfTheEngineAreTheListedOnes) {
    compare(ENGINE_PATH, "libprotgen.names");
}

}  // namespace
