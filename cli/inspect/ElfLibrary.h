// A shared library as its file describes it. Nothing of it is executed.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "cli/inspect/Architecture.h"

namespace cli {

/// A symbol that the library expects from others.
struct ExpectedSymbol {
    std::string name;     ///< Mangled.
    std::string version;  ///< E.g. "GLIBC_2.4"; empty when none is asked for.
    std::string library;  ///< Who shall have that version, e.g. "libc.so.6"; empty without version.
};

struct ElfLibrary {
    Architecture architecture;
    std::vector<std::string> needed;       ///< Names of libraries, in the order of the file.
    std::vector<std::string> runPaths;     ///< Folders to look in, "$ORIGIN" as it stands.
    std::vector<std::string> versions;     ///< Versions asked for, e.g. "GLIBC_2.4".
    std::vector<ExpectedSymbol> expected;  ///< Without those that may stay away (weak).
    std::set<std::string> defined;         ///< Mangled names.

    /// Reads the dynamic sections of a file.
    /// Errors: CommandError (Other) when it can't be read or is no shared library.
    static ElfLibrary read(const std::string& path);
};

}  // namespace cli
