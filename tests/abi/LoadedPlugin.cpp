#include "tests/abi/LoadedPlugin.h"

#include <dlfcn.h>

#include <cstdlib>
#include <stdexcept>

namespace abi_test {

Plugin::Plugin(const std::filesystem::path& file)
    : handle_(dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL)) {
    if (handle_ == nullptr) throw std::runtime_error(dlerror());
}

Plugin::~Plugin() {
    dlclose(handle_);
}

void* Plugin::symbol(const char* name) const {
    void* const found = dlsym(handle_, name);
    if (found == nullptr) throw std::runtime_error(std::string("no symbol ") + name);
    return found;
}

IInterface* Plugin::interface(const char* name) const {
    const auto entry = reinterpret_cast<GetInterfaceFactoryFunction>(symbol("GetInterfaceFactory"));
    return entry()->CreateInterface(name);
}

IProtModule& Plugin::module() const {
    return *static_cast<IProtModule*>(interface("IProtModule")->ConvertTo("IProtModule"));
}

IProtocolFactory& Plugin::protocols() const {
    return *static_cast<IProtocolFactory*>(
        interface("IProtocolFactory")->ConvertTo("IProtocolFactory"));
}

bool Plugin::isLoaded(const std::filesystem::path& file) {
    void* const handle = dlopen(file.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle != nullptr) dlclose(handle);
    return handle != nullptr;
}

std::string command(IProtocol& protocol, const char* line) {
    char answer[512] = {};
    auto* const console = static_cast<IProtocol2*>(protocol.ConvertTo("IProtocol2"));
    EXPECT_EQ(1, console->DoCommand(line, answer, sizeof answer - 1)) << line;
    return answer;
}

PluginCopy::PluginCopy() {
    std::string folder = std::filesystem::temp_directory_path() / "mrtu-abi-XXXXXX";
    if (mkdtemp(folder.data()) == nullptr) throw std::runtime_error("no folder " + folder);
    folder_ = folder;
    for (const std::filesystem::path file : {PLUGIN_PATH, ENGINE_PATH})
        std::filesystem::copy_file(file, folder_ / file.filename());
    file_ = folder_ / std::filesystem::path(PLUGIN_PATH).filename();
}

PluginCopy::~PluginCopy() {
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
}

}  // namespace abi_test
