// The folders that the loader looks in for what a library needs.
#include "cli/inspect/SearchPlaces.h"

#include "cli/ExitCode.h"

namespace cli {
namespace {

namespace fs = std::filesystem;

fs::path folderOf(const std::string& path) {
    const fs::path folder = fs::path(path).parent_path();
    return folder.empty() ? fs::path(".") : folder;
}

fs::path expanded(std::string runPath, const fs::path& origin) {
    for (const std::string variable : {"$ORIGIN", "${ORIGIN}"}) {
        const auto at = runPath.find(variable);
        if (at != std::string::npos) runPath.replace(at, variable.size(), origin.string());
    }
    return runPath;
}

bool isLibraryFor(const Architecture& architecture, const fs::path& file) {
    try {
        return sameArchitecture(ElfLibrary::architectureOf(file.string()), architecture);
    } catch (const CommandError&) {
        return false;
    }
}

}  // namespace

std::vector<fs::path> searchPlaces(const std::string& path, const ElfLibrary& library) {
    const fs::path origin = folderOf(path);
    std::vector<fs::path> places;
    for (const std::string& runPath : library.runPaths)
        places.push_back(expanded(runPath, origin));
    places.push_back(origin);
    const std::string triplet = debianTriplet(library.architecture);
    if (triplet.empty()) return places;
    places.push_back(fs::path("/lib") / triplet);
    places.push_back(fs::path("/usr/lib") / triplet);
    // Where Debian's cross compilers have the target's libraries.
    places.push_back(fs::path("/usr") / triplet / "lib");
    return places;
}

std::optional<fs::path> findLibrary(const std::string& name, const std::vector<fs::path>& places,
                                    const Architecture& architecture) {
    for (const fs::path& place : places) {
        std::error_code ignored;
        const fs::path file = place / name;
        if (fs::is_regular_file(file, ignored) && isLibraryFor(architecture, file)) return file;
    }
    return std::nullopt;
}

}  // namespace cli
