// What a plug-in file is and whether it has all that it needs. Nothing is executed.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "cli/inspect/ElfLibrary.h"

namespace cli {

struct NeededLibrary {
    std::string name;
    std::optional<std::string> file;  ///< Where it was found on this machine.
};

struct Inspection {
    std::string file;
    Architecture architecture;
    bool runsHere = false;  ///< The architecture is this program's own.
    bool hasEntry = false;  ///< "GetInterfaceFactory" is defined.
    std::string glibc;      ///< The oldest C library that it loads on, e.g. "2.4".
    std::vector<NeededLibrary> needed;
    /// Symbols that no library found here defines, demangled; the first thousand of them. Those
    /// that a library not found here must have, by their version, are not among them.
    std::vector<std::string> missing;
    std::size_t missingCount = 0;  ///< All of them.
    /// The marker line in front of the description, e.g. "Name=MRTU?FullName=...", its first 500
    /// bytes; empty when the file has none.
    std::string descriptionHeader;

    [[nodiscard]] bool isComplete() const { return hasEntry && missing.empty(); }
};

/// Ends with every file, whatever it holds; texts are the file's own bytes.
/// Errors: CommandError (Other) when the file can't be read, is no shared library, or holds more
/// than a library does (see ElfLibrary::read()).
Inspection inspect(const std::string& path);

}  // namespace cli
