// The host services of this process, as the module object received them.
//
// The pointers are declared here, where framework and driver need them, and defined and filled by
// the plug-in's module object. They are null until IProtModule::Init() succeeds, shared by every
// protocol object of the process, written by Init() and Close() only and read freely by all.
#pragma once

#include "platform/IInterface.h"

extern IInterface* piMultiTask;         // "IMultiTask2"
extern IInterface* piSerialFactory;     // "ISerialFactory"
extern IInterface* piSocketFactory;     // "ISocketFactory"
extern IInterface* piCDSBuffer;         // "ICDSBuffer"
extern IInterface* piDiag;              // "IDiag"
extern IInterface* piPermanentStorage;  // "IPermanentStorage"
extern IInterface* piDriverInterface;   // "IDriverInterface"
extern IInterface* piSmux;              // "ISmux"
extern IInterface* piFastTimer;         // "IFastTimer"

/// The service in `held` as the interface `Service`, whose name is `name`; null when `held` is
/// null. The host handed the object out under exactly that name, so one that does not answer the
/// query is still an object of that interface.
template <class Service>
Service* serviceAs(IInterface* held, const char* name) {
    if (held == nullptr) return nullptr;
    if (void* face = held->ConvertTo(name)) return static_cast<Service*>(face);
    return static_cast<Service*>(held);
}
