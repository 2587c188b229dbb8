// Follows what a plug-in needs through all its libraries.
#include "cli/inspect/Inspection.h"

#include <fmt/format.h>

#include <algorithm>
#include <deque>
#include <set>

#include "cli/ExitCode.h"
#include "cli/inspect/ReadableName.h"
#include "cli/inspect/SearchPlaces.h"
#include "cli/inspect/SymbolVersion.h"
#include "settings/FileReader.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

constexpr const char* kEntry = "GetInterfaceFactory";
constexpr std::string_view kMarker = "<<ICOM_XML_START>>";

/// The marker line of a description is shorter.
constexpr std::size_t kLongestHeader = 500;
constexpr std::size_t kMostMissing = 1000;
constexpr std::size_t kMostLibraries = 256;

std::string descriptionHeaderIn(const std::string& path) {
    std::string bytes;
    try {
        bytes = settings::readFile(path, {.bytes = kLargestLibrary});
    } catch (const settings::FileError& error) {
        throw CommandError(ExitCode::Other,
                           fmt::format("{}: {}", values::printableText(path), error.what()));
    }
    const auto at = bytes.find(kMarker);
    if (at == std::string::npos) return {};
    const auto begin = at + kMarker.size();
    return bytes.substr(begin, std::min(bytes.find('\0', begin) - begin, kLongestHeader));
}

/// What the needed libraries define, and those that they need in their turn.
struct Surroundings {
    std::set<std::string> defined;
    std::set<std::string> absent;
};

Surroundings surroundingsOf(const std::string& path, const ElfLibrary& library,
                            ReadingBudget& budget) {
    Surroundings around;
    const auto places = searchPlaces(path, library);
    std::deque<std::string> waiting(library.needed.begin(), library.needed.end());
    std::set<std::string> seen(library.needed.begin(), library.needed.end());
    for (; !waiting.empty(); waiting.pop_front()) {
        const auto file = findLibrary(waiting.front(), places, library.architecture);
        if (!file) {
            around.absent.insert(waiting.front());
            continue;
        }
        const ElfLibrary other = ElfLibrary::read(file->string(), budget);
        around.defined.insert(other.defined.begin(), other.defined.end());
        for (const std::string& name : other.needed)
            if (seen.insert(name).second) waiting.push_back(name);
        if (seen.size() > kMostLibraries) {
            throw CommandError(ExitCode::Other,
                               fmt::format("{}: needs more than {} libraries",
                                           values::printableText(path), kMostLibraries));
        }
    }
    return around;
}

std::vector<std::string> missingIn(const ElfLibrary& library, const Surroundings& around) {
    std::vector<std::string> missing;
    for (const ExpectedSymbol& symbol : library.expected) {
        if (library.defined.contains(symbol.name) || around.defined.contains(symbol.name)) continue;
        if (around.absent.contains(symbol.library)) continue;
        missing.push_back(symbol.name);
    }
    std::sort(missing.begin(), missing.end());
    return missing;
}

std::vector<std::string> readable(std::vector<std::string> names) {
    names.resize(std::min(names.size(), kMostMissing));
    std::transform(names.begin(), names.end(), names.begin(), readableName);
    std::sort(names.begin(), names.end());
    return names;
}

std::vector<NeededLibrary> neededBy(const std::string& path, const ElfLibrary& library) {
    std::vector<NeededLibrary> needed;
    const auto places = searchPlaces(path, library);
    for (const std::string& name : library.needed) {
        const auto file = findLibrary(name, places, library.architecture);
        needed.push_back({name, file ? std::optional(file->string()) : std::nullopt});
    }
    return needed;
}

}  // namespace

Inspection inspect(const std::string& path) {
    ReadingBudget budget;
    const ElfLibrary library = ElfLibrary::read(path, budget);
    const auto missing = missingIn(library, surroundingsOf(path, library, budget));
    return {.file = path,
            .architecture = library.architecture,
            .runsHere = sameArchitecture(library.architecture, ownArchitecture()),
            .hasEntry = library.defined.contains(kEntry),
            .glibc = newestGlibc(library.versions),
            .needed = neededBy(path, library),
            .missing = readable(missing),
            .missingCount = missing.size(),
            .descriptionHeader = descriptionHeaderIn(path)};
}

}  // namespace cli
