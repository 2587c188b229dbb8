#include "runtime/HostServices.h"

#include <algorithm>
#include <numeric>

namespace runtime {

HostServices::HostServices(IMultiTask2& multiTask, ISerialFactory& serial,
                           IPermanentStorage* storage)
    : services_{{"IMultiTask2", &multiTask, 0},
                {"ISerialFactory", &serial, 0},
                {"ISocketFactory", &sockets_, 0},
                {"ICDSBuffer", &dataBuffer_, 0}} {
    if (storage != nullptr) services_.push_back({"IPermanentStorage", storage, 0});
}

IInterface* HostServices::CreateInterface(const char* name) {
    const std::lock_guard guard(mutex_);
    for (Service& service : services_) {
        if (!CompareInterface(name, service.name.c_str())) continue;
        ++service.held;
        return service.object;
    }
    return nullptr;
}

void HostServices::ReleaseInterface(IInterface* held) {
    const std::lock_guard guard(mutex_);
    const auto owner = std::find_if(
        services_.begin(), services_.end(),
        [held](const Service& service) { return service.object == held && service.held > 0; });
    if (owner == services_.end()) {
        ++strayReleases_;
    } else {
        --owner->held;
    }
}

int HostServices::outstanding() const {
    const std::lock_guard guard(mutex_);
    return std::accumulate(services_.begin(), services_.end(), 0,
                           [](int sum, const Service& service) { return sum + service.held; });
}

int HostServices::outstanding(const std::string& name) const {
    const std::lock_guard guard(mutex_);
    for (const Service& service : services_) {
        if (service.name == name) return service.held;
    }
    return 0;
}

int HostServices::strayReleases() const {
    const std::lock_guard guard(mutex_);
    return strayReleases_;
}

void* HostServices::Sockets::ConvertTo(const char* name) {
    return CompareInterface(name, "ISocketFactory") ? static_cast<ISocketFactory*>(this) : nullptr;
}

void* HostServices::DataBuffer::ConvertTo(const char* name) {
    return CompareInterface(name, "ICDSBuffer") ? static_cast<ICDSBuffer*>(this) : nullptr;
}

}  // namespace runtime
