// Loads a plug-in with dlopen() and looks up its one entry.
#include "runtime/PluginLibrary.h"

#include <dlfcn.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

namespace runtime {
namespace {

constexpr const char* kEntry = "GetInterfaceFactory";

/// The system's loader searches its own directories for a name without a slash.
std::string withDirectory(const std::string& path) {
    return path.find('/') == std::string::npos ? "./" + path : path;
}

/// @return why the file can't be read, empty when it can.
std::string unreadable(const std::string& path) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0) return std::strerror(errno);
    if (::access(path.c_str(), R_OK) != 0) return std::strerror(errno);
    return {};
}

std::string loaderComplaint() {
    const char* text = ::dlerror();
    return text != nullptr ? text : "unknown reason";
}

PluginError fault(PluginFault kind, const std::string& path, const std::string& why) {
    return {kind, path + ": " + why};
}

}  // namespace

Result<PluginLibrary, PluginError> PluginLibrary::load(const std::string& path) {
    const std::string file = withDirectory(path);
    if (const std::string why = unreadable(file); !why.empty()) {
        return fault(PluginFault::NoSuchFile, path, why);
    }
    void* opened = ::dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (opened == nullptr) {
        return fault(PluginFault::NotALibrary, path,
                     "not a loadable library: " + loaderComplaint());
    }
    std::shared_ptr<void> handle(opened, [](void* library) { ::dlclose(library); });

    void* symbol = ::dlsym(opened, kEntry);
    if (symbol == nullptr) {
        return fault(PluginFault::NotADriver, path,
                     std::string("not a driver: it has no ") + kEntry);
    }
    const auto entry = reinterpret_cast<GetInterfaceFactoryFunction>(symbol);
    IInterfaceFactory* factory = entry();
    if (factory == nullptr) {
        return fault(PluginFault::NotADriver, path,
                     std::string("not a driver: its ") + kEntry + " gives no factory");
    }
    return PluginLibrary(std::move(handle), *factory, path);
}

}  // namespace runtime
