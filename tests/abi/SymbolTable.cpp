#include "tests/abi/SymbolTable.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdio>

namespace abi_test {
namespace {

/// "00012345 T name" or "         U name", either with "@VERSION" behind it.
Symbol symbolOf(const std::string& line) {
    const std::size_t kind = line.find_first_of("ABCDGNRSTUVWbdrtuvwi", line.find(' '));
    if (kind == std::string::npos || kind + 2 > line.size()) return {};
    const std::string name = line.substr(kind + 2);
    const std::size_t at = name.find('@');
    const std::size_t version = name.find_first_not_of('@', at);
    return {line[kind], name.substr(0, at),
            version == std::string::npos ? "" : name.substr(version)};
}

}  // namespace

std::vector<std::string> linesOf(const std::string& command) {
    std::vector<std::string> lines;
    FILE* const pipe = popen(command.c_str(), "r");
    if (pipe == nullptr) {
        ADD_FAILURE() << command;
        return lines;
    }
    std::array<char, 8192> line{};
    while (std::fgets(line.data(), static_cast<int>(line.size()), pipe) != nullptr) {
        std::string text(line.data());
        if (text.ends_with('\n')) text.pop_back();
        lines.push_back(text);
    }
    EXPECT_EQ(0, pclose(pipe)) << command;
    return lines;
}

std::vector<Symbol> symbolsOf(const std::string& library) {
    std::vector<Symbol> symbols;
    for (const std::string& line : linesOf(std::string(NM_PROGRAM) + " -DC " + library))
        symbols.push_back(symbolOf(line));
    EXPECT_FALSE(symbols.empty()) << library;
    return symbols;
}

bool isStrongDefinition(const Symbol& symbol) {
    return std::string("TDBR").find(symbol.kind) != std::string::npos;
}

}  // namespace abi_test
