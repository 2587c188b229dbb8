#include "plugin/ProtModule.h"

#include <array>

#include "framework/HostServicePointers.h"

IInterface* piMultiTask = nullptr;
IInterface* piSerialFactory = nullptr;
IInterface* piSocketFactory = nullptr;
IInterface* piCDSBuffer = nullptr;
IInterface* piDiag = nullptr;
IInterface* piPermanentStorage = nullptr;
IInterface* piDriverInterface = nullptr;
IInterface* piSmux = nullptr;
IInterface* piFastTimer = nullptr;

namespace {

struct Service {
    IInterface*& pointer;
    const char* name;
    const char* missing;  ///< Error text; null for a service that the driver can do without.
};

// In the order in which they are taken.
const std::array kServices{
    Service{piMultiTask, "IMultiTask2", "IMultiTask2 not created"},
    Service{piSerialFactory, "ISerialFactory", "ISerialFactory not created"},
    Service{piSocketFactory, "ISocketFactory", "ISocketFactory not created"},
    Service{piCDSBuffer, "ICDSBuffer", "piCDSBuffer not created"},
    Service{piDiag, "IDiag", nullptr},
    Service{piPermanentStorage, "IPermanentStorage", nullptr},
    Service{piDriverInterface, "IDriverInterface", nullptr},
    Service{piSmux, "ISmux", nullptr},
    Service{piFastTimer, "IFastTimer", nullptr},
};

// The order of handing back: first the optional services, which may lean on the required ones.
IInterface** const kOptionalServices[] = {&piFastTimer, &piSmux, &piDriverInterface, &piDiag,
                                          &piPermanentStorage};
IInterface** const kRequiredServices[] = {&piMultiTask, &piSerialFactory, &piSocketFactory,
                                          &piCDSBuffer};

void handBack(IInterfaceFactory& host, IInterface*& service) {
    host.ReleaseInterface(service);
    service = nullptr;
}

}  // namespace

ProtModule::~ProtModule() {
    ProtModule::Close();
}

void* ProtModule::ConvertTo(const char* name) {
    const bool known =
        CompareInterface(name, "ProtModule") || CompareInterface(name, "IProtModule");
    return known ? this : nullptr;
}

int ProtModule::Init(IInterfaceFactory* host) {
    if (initCount_ != 0) {
        ++initCount_;
        return 1;
    }
    if (host == nullptr) {
        lastError_ = "Interface factory not given";
        return 0;
    }
    for (const Service& service : kServices) {
        service.pointer = host->CreateInterface(service.name);
        if (service.pointer != nullptr || service.missing == nullptr) continue;
        // What was taken goes back in the order in which it came; the pointers keep their values
        // until the next successful call overwrites them.
        for (const Service* taken = kServices.data(); taken != &service; ++taken)
            host->ReleaseInterface(taken->pointer);
        lastError_ = service.missing;
        return 0;
    }
    host_ = host;
    initCount_ = 1;
    return 1;
}

void ProtModule::Close() {
    if (initCount_ == 0) return;
    if (--initCount_ != 0) return;
    for (IInterface** service : kOptionalServices)
        if (*service != nullptr) handBack(*host_, *service);
    for (IInterface** service : kRequiredServices)
        handBack(*host_, *service);
    host_ = nullptr;
}
