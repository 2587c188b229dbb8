// A shared library as its file describes it. Nothing of it is executed.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "cli/inspect/Architecture.h"
#include "cli/inspect/ReadingBudget.h"

namespace cli {

/// A symbol that the library expects from others.
struct ExpectedSymbol {
    std::string name;     ///< Mangled.
    std::string version;  ///< E.g. "GLIBC_2.4"; empty when none is asked for.
    std::string library;  ///< Who shall have that version, e.g. "libc.so.6"; empty without version.
};

/// The texts are the file's own bytes: they may hold anything but zeroes.
struct ElfLibrary {
    Architecture architecture;
    std::vector<std::string> needed;       ///< Names of libraries, in the order of the file.
    std::vector<std::string> runPaths;     ///< Folders to look in, "$ORIGIN" as it stands.
    std::vector<std::string> versions;     ///< Versions asked for, e.g. "GLIBC_2.4".
    std::vector<ExpectedSymbol> expected;  ///< Without those that may stay away (weak).
    std::set<std::string> defined;         ///< Mangled names.

    /// Reads the dynamic sections of a file.
    /// Errors: CommandError (Other) when it can't be read, is no shared library, is larger than
    /// 128 MiB, names more than 256 libraries or 64 folders, or exhausts the budget.
    static ElfLibrary read(const std::string& path, ReadingBudget& budget);
    static ElfLibrary read(const std::string& path);

    /// Reads the header alone.
    /// Errors: as read().
    static Architecture architectureOf(const std::string& path);
};

/// No library is read beyond this length.
inline constexpr std::size_t kLargestLibrary = std::size_t{128} * 1024 * 1024;

}  // namespace cli
