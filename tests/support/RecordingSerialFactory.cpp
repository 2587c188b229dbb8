#include "tests/support/RecordingSerialFactory.h"

#include <gtest/gtest.h>

namespace testing_support {

RecordingSerialFactory::~RecordingSerialFactory() {
    if (!open_.empty()) ADD_FAILURE() << open_.size() << " port(s) were never released";
}

void* RecordingSerialFactory::ConvertTo(const char* name) {
    return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this) : nullptr;
}

ISerialPort* RecordingSerialFactory::openPort(const char* name) {
    opened_.emplace_back(name);
    const auto found = offered_.find(name);
    if (found == offered_.end()) return nullptr;
    if (!open_.insert(found->second).second) ADD_FAILURE() << name << " was opened twice";
    if (auto* scripted = dynamic_cast<ScriptedPort*>(found->second)) scripted->markOpen();
    return found->second;
}

void RecordingSerialFactory::releasePort(ISerialPort* port) {
    if (open_.erase(port) == 0) {
        ADD_FAILURE() << "a port was released that is not open";
        return;
    }
    ++released_;
    if (auto* scripted = dynamic_cast<ScriptedPort*>(port)) scripted->markReleased();
}

}  // namespace testing_support
