// Finds the storage's place by the environment and makes its directories.
#include "runtime/StoragePath.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>

namespace runtime {
namespace {

bool isAbsolute(const char* path) {
    return path != nullptr && path[0] == '/';
}

bool isDirectory(const std::string& path) {
    struct stat info {};
    return ::stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

/// @return empty, or why there is no such directory.
std::string makeDirectory(const std::string& path) {
    if (::mkdir(path.c_str(), 0700) == 0 || isDirectory(path)) return {};
    // A file in the place of the directory says "exists", which would mislead.
    const int why = errno == EEXIST ? ENOTDIR : errno;
    return path + ": " + std::strerror(why);
}

}  // namespace

std::string storagePathFrom(const char* xdgStateHome, const char* home) {
    constexpr const char* kFile = "/mrtu/overrides.db";
    if (isAbsolute(xdgStateHome)) return std::string(xdgStateHome) + kFile;
    if (isAbsolute(home)) return std::string(home) + "/.local/state" + kFile;
    return {};
}

std::string defaultStoragePath() {
    return storagePathFrom(std::getenv("XDG_STATE_HOME"), std::getenv("HOME"));
}

std::string directoryOf(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    if (slash == std::string::npos) return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

std::string makeDirectoriesFor(const std::string& path) {
    const std::string directory = directoryOf(path);
    if (isDirectory(directory)) return {};
    for (std::size_t end = directory.find('/', 1);; end = directory.find('/', end + 1)) {
        const std::string step = directory.substr(0, end);
        if (!isDirectory(step)) {
            if (std::string fault = makeDirectory(step); !fault.empty()) return fault;
        }
        if (end == std::string::npos) return {};
    }
}

}  // namespace runtime
