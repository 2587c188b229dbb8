// What the plug-in file shows and what it expects of the run time.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <sstream>
#include <string>
#include <vector>

namespace {

struct Symbol {
    char kind;
    std::string name;
};

/// The dynamic symbols, as the linker's own tool lists them.
std::vector<Symbol> symbols(bool demangled) {
    const std::string command =
        std::string(NM_PROGRAM) + (demangled ? " -DC " : " -D ") + PLUGIN_PATH;
    FILE* pipe = popen(command.c_str(), "r");
    if (pipe == nullptr) {
        ADD_FAILURE() << command;
        return {};
    }
    std::vector<Symbol> found;
    std::array<char, 4096> line{};
    while (std::fgets(line.data(), static_cast<int>(line.size()), pipe) != nullptr) {
        const std::string text(line.data());
        // "0000000000012345 T name" or "                 U name".
        const auto kind = text.find_first_of("ABCDGNRSTUVWbdrtuvwi", text.find(' '));
        if (kind == std::string::npos) continue;
        std::string name = text.substr(kind + 2);
        name = name.substr(0, name.find_last_not_of('\n') + 1);
        found.push_back({text[kind], name.substr(0, name.find('@'))});
    }
    EXPECT_EQ(0, pclose(pipe)) << command;
    return found;
}

bool isMangled(const std::string& name) {
    return name.starts_with("_Z");
}

bool isDefinedFunction(const Symbol& symbol) {
    return symbol.kind == 'T' || symbol.kind == 'i';
}

TEST(SymbolsTest, TheEntryIsTheOnlyPlainFunction) {
    std::vector<std::string> plain;
    for (const Symbol& symbol : symbols(false))
        if (isDefinedFunction(symbol) && !isMangled(symbol.name)) plain.push_back(symbol.name);
    EXPECT_EQ(std::vector<std::string>{"GetInterfaceFactory"}, plain);
}

/// An inline function of a header may be there as a weak copy; anything else is a definition.
bool isDefinition(const Symbol& symbol) {
    return symbol.kind != 'U' && symbol.kind != 'w' && symbol.kind != 'W';
}

TEST(SymbolsTest, TheEngineIsExpectedFromTheRunTime) {
    std::size_t operations = 0;
    for (const Symbol& symbol : symbols(true)) {
        if (!symbol.name.starts_with("Protgen")) continue;
        EXPECT_FALSE(isDefinition(symbol)) << symbol.kind << ' ' << symbol.name;
        if (symbol.kind == 'U') ++operations;
    }
    EXPECT_GT(operations, 20U) << "the engine's operations";
}

TEST(SymbolsTest, TheEnginesTypesAreExpectedFromTheRunTime) {
    std::vector<std::string> typeInfos;
    for (const Symbol& symbol : symbols(true)) {
        if (!symbol.name.ends_with("for ProtgenProtocol") &&
            !symbol.name.ends_with("for ProtgenTag"))
            continue;
        EXPECT_EQ('U', symbol.kind) << symbol.name;
        if (symbol.name.starts_with("typeinfo for")) typeInfos.push_back(symbol.name);
    }
    std::sort(typeInfos.begin(), typeInfos.end());
    EXPECT_EQ((std::vector<std::string>{"typeinfo for ProtgenProtocol", "typeinfo for ProtgenTag"}),
              typeInfos);
}

TEST(SymbolsTest, ExportedFunctionsAreVisible) {
    const char* const exported[] = {
        "ProtUtilsN::GetLenOfBits(int, int)",
        "ProtUtilsN::CopyBits(unsigned char*, unsigned char const*, int, int)",
        "ProtUtilsN::UnpackBits(unsigned char*, unsigned char const*, int, int)",
        "ProtUtilsN::PackBits(unsigned char*, unsigned char const*, int, int)",
        "ProtUtilsN::shiftBits(unsigned char*, int, unsigned char const*, int, int)",
        "ProtUtilsN::getStartingBit(ITag const*)",
        "ProtUtilsN::getEndingBit(ITag const*)",
        "calcCRC(unsigned char const*, int)",
        "getExceptionText(unsigned char)",
        "GetXml_MRTU()",
        "CreateProtocol_MRTU()",
        "currentTimeStamp()",
        "itoa(int, char*, int)",
    };
    const std::vector<Symbol> all = symbols(true);
    for (const char* name : exported)
        EXPECT_TRUE(std::any_of(all.begin(), all.end(), [name](const Symbol& symbol) {
            return symbol.name == name && isDefinedFunction(symbol);
        })) << name;
}

TEST(SymbolsTest, NothingOfTheCppRunTimeIsShown) {
    for (const Symbol& symbol : symbols(true)) {
        EXPECT_NE('u', symbol.kind) << symbol.name << " would keep the library loaded for ever";
        if (!isDefinition(symbol)) continue;
        EXPECT_FALSE(symbol.name.starts_with("std::") || symbol.name.starts_with("__cxa") ||
                     symbol.name.starts_with("__gnu_cxx") || symbol.name.starts_with("operator "))
            << symbol.kind << ' ' << symbol.name;
    }
}

}  // namespace
