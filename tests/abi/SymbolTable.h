// The dynamic symbols of a library file, as the tools of its architecture list them.
#pragma once

#include <string>
#include <vector>

namespace abi_test {

struct Symbol {
    char kind;  ///< As nm prints it: T code, D B R data, V W weak, u unique, U undefined.
    std::string name;
    std::string version;  ///< What stands behind "@", e.g. "GLIBC_2.4"; empty when there is none.
};

/// What the command prints, by line. The test fails when it ends in an error.
std::vector<std::string> linesOf(const std::string& command);

/// The dynamic symbols, demangled.
std::vector<Symbol> symbolsOf(const std::string& library);

/// The symbol is part of the library for good. A weak copy of an inline function comes and goes
/// with the compiler's mood, so it is not.
bool isStrongDefinition(const Symbol& symbol);

}  // namespace abi_test
