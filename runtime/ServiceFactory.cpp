// Hands services out by name and counts what is held.
#include "runtime/ServiceFactory.h"

#include <algorithm>
#include <numeric>

namespace runtime {

ServiceFactory::ServiceFactory(IMultiTask2& multiTask, ISerialFactory& serial,
                               IPermanentStorage* storage)
    : services_{{"IMultiTask2", &multiTask, 0},
                {"ISerialFactory", &serial, 0},
                {"ISocketFactory", &sockets_, 0},
                {"ICDSBuffer", &dataBuffer_, 0}} {
    if (storage != nullptr) services_.push_back({"IPermanentStorage", storage, 0});
}

IInterface* ServiceFactory::CreateInterface(const char* name) {
    const std::lock_guard guard(mutex_);
    for (Service& service : services_) {
        if (!CompareInterface(name, service.name.c_str())) continue;
        ++service.held;
        return service.object;
    }
    return nullptr;
}

void ServiceFactory::ReleaseInterface(IInterface* held) {
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

int ServiceFactory::outstanding() const {
    const std::lock_guard guard(mutex_);
    return std::accumulate(services_.begin(), services_.end(), 0,
                           [](int sum, const Service& service) { return sum + service.held; });
}

int ServiceFactory::outstanding(const std::string& name) const {
    const std::lock_guard guard(mutex_);
    for (const Service& service : services_) {
        if (service.name == name) return service.held;
    }
    return 0;
}

int ServiceFactory::strayReleases() const {
    const std::lock_guard guard(mutex_);
    return strayReleases_;
}

void* ServiceFactory::Sockets::ConvertTo(const char* name) {
    return CompareInterface(name, "ISocketFactory") ? static_cast<ISocketFactory*>(this) : nullptr;
}

void* ServiceFactory::DataBuffer::ConvertTo(const char* name) {
    return CompareInterface(name, "ICDSBuffer") ? static_cast<ICDSBuffer*>(this) : nullptr;
}

}  // namespace runtime
