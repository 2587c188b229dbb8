// A host whose services do nothing, for plug-ins that only hold them.
#pragma once

#include "runtime/HostServices.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"

struct FakeHost {
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    runtime::HostServices services{multiTask, serial};
};

/// A fake plug-in's file; tests/unit/runtime/CMakeLists.txt builds them.
inline std::string fakePlugin(const char* name) {
    return std::string(FAKE_PLUGINS "/") + name;
}
