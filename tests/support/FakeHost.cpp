#include "tests/support/FakeHost.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace testing_support {

FakeHost::FakeHost() {
    offered_ = {{"IMultiTask2", &multiTask},
                {"ISerialFactory", &serialFactory},
                {"ISocketFactory", &socketFactory_},
                {"ICDSBuffer", &cdsBuffer_},
                {"IDiag", &diag_},
                {"IPermanentStorage", &storage},
                {"IDriverInterface", &driverInterface_},
                {"ISmux", &smux_},
                {"IFastTimer", &fastTimer_}};
}

IInterface* FakeHost::CreateInterface(const char* name) {
    calls_.push_back(std::string("create ") + name);
    const auto found = offered_.find(name);
    if (found == offered_.end() || withheld_.contains(name)) return nullptr;
    ++held_[name];
    return found->second;
}

void FakeHost::ReleaseInterface(IInterface* service) {
    const auto found = std::find_if(offered_.begin(), offered_.end(), [service](const auto& offer) {
        return offer.second == service;
    });
    if (found == offered_.end()) {
        ADD_FAILURE() << "a service was released that is none of this host";
        return;
    }
    calls_.push_back("release " + found->first);
    if (--held_[found->first] < 0) ADD_FAILURE() << found->first << " was released once too often";
}

int FakeHost::created(const std::string& name) const {
    return static_cast<int>(std::count(calls_.begin(), calls_.end(), "create " + name));
}

int FakeHost::released(const std::string& name) const {
    return static_cast<int>(std::count(calls_.begin(), calls_.end(), "release " + name));
}

int FakeHost::held() const {
    int sum = 0;
    for (const auto& [name, count] : held_)
        sum += count;
    return sum;
}

}  // namespace testing_support
