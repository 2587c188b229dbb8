#include "cli/inspect/Inspection.h"

#include <cxxabi.h>

#include <algorithm>
#include <cstdlib>
#include <deque>
#include <fstream>
#include <iterator>
#include <memory>
#include <set>

#include "cli/inspect/SearchPlaces.h"
#include "cli/inspect/SymbolVersion.h"

namespace cli {
namespace {

constexpr const char* kEntry = "GetInterfaceFactory";
constexpr std::string_view kMarker = "<<ICOM_XML_START>>";

std::string demangled(const std::string& name) {
    int status = 0;
    const std::unique_ptr<char, decltype(&std::free)> text(
        abi::__cxa_demangle(name.c_str(), nullptr, nullptr, &status), &std::free);
    return status == 0 && text != nullptr ? text.get() : name;
}

std::string descriptionHeaderIn(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    const std::string bytes{std::istreambuf_iterator<char>(file), {}};
    const auto at = bytes.find(kMarker);
    if (at == std::string::npos) return {};
    const auto begin = at + kMarker.size();
    return bytes.substr(begin, bytes.find('\0', begin) - begin);
}

/// What the needed libraries define, and those that they need in their turn.
struct Surroundings {
    std::set<std::string> defined;
    std::set<std::string> absent;
};

Surroundings surroundingsOf(const std::string& path, const ElfLibrary& library) {
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
        const ElfLibrary other = ElfLibrary::read(file->string());
        around.defined.insert(other.defined.begin(), other.defined.end());
        for (const std::string& name : other.needed)
            if (seen.insert(name).second) waiting.push_back(name);
    }
    return around;
}

std::vector<std::string> missingIn(const ElfLibrary& library, const Surroundings& around) {
    std::vector<std::string> missing;
    for (const ExpectedSymbol& symbol : library.expected) {
        if (library.defined.contains(symbol.name) || around.defined.contains(symbol.name)) continue;
        if (around.absent.contains(symbol.library)) continue;
        missing.push_back(demangled(symbol.name));
    }
    std::sort(missing.begin(), missing.end());
    return missing;
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
    const ElfLibrary library = ElfLibrary::read(path);
    return {.file = path,
            .architecture = library.architecture,
            .runsHere = sameArchitecture(library.architecture, ownArchitecture()),
            .hasEntry = library.defined.contains(kEntry),
            .glibc = newestGlibc(library.versions),
            .needed = neededBy(path, library),
            .missing = missingIn(library, surroundingsOf(path, library)),
            .descriptionHeader = descriptionHeaderIn(path)};
}

}  // namespace cli
