#include "tests/unit/plugin/LoadedLibrary.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

LoadedLibrary::LoadedLibrary() : handle_(dlopen(PLUGIN_PATH, RTLD_NOW | RTLD_LOCAL)) {
    if (handle_ == nullptr) ADD_FAILURE() << dlerror();
}

LoadedLibrary::~LoadedLibrary() {
    unload();
}

void LoadedLibrary::unload() {
    if (handle_ != nullptr) dlclose(handle_);
    handle_ = nullptr;
}

void* LoadedLibrary::symbol(const char* name) const {
    return dlsym(handle_, name);
}

IInterfaceFactory* LoadedLibrary::factory() const {
    const auto entry = reinterpret_cast<GetInterfaceFactoryFunction>(symbol("GetInterfaceFactory"));
    return entry == nullptr ? nullptr : entry();
}

IProtModule* LoadedLibrary::module() const {
    IInterface* found = factory()->CreateInterface("IProtModule");
    return static_cast<IProtModule*>(found->ConvertTo("IProtModule"));
}

IProtocolFactory* LoadedLibrary::protocols() const {
    IInterface* found = factory()->CreateInterface("IProtocolFactory");
    return static_cast<IProtocolFactory*>(found->ConvertTo("IProtocolFactory"));
}

bool LoadedLibrary::stillThere() {
    void* handle = dlopen(PLUGIN_PATH, RTLD_NOW | RTLD_NOLOAD);
    if (handle != nullptr) dlclose(handle);
    return handle != nullptr;
}
