// A host whose services do nothing, for plug-ins that only hold them.
#pragma once

#include <dlfcn.h>

#include <string>

#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"

struct FakeHost {
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    runtime::ServiceFactory services{multiTask, serial};
};

/// A fake plug-in's file; tests/unit/runtime/CMakeLists.txt builds them.
inline std::string fakePlugin(const char* name) {
    return std::string(FAKE_PLUGINS "/") + name;
}

/// Whether the library is loaded, by whomever.
inline bool isLoaded(const std::string& path) {
    void* handle = ::dlopen(path.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle == nullptr) return false;
    ::dlclose(handle);
    return true;
}
