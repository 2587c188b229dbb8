#include "plugin/ProtFactory.h"

#include "framework/Guarded.h"
#include "mrtu/Protocol_MRTU.h"
#include "plugin/ProtModule.h"

namespace {

struct Factory {
    InterfaceFactory interfaces;
    ProtocolFactory protocols;
    ProtModule module;
};

// Built before every other static object of the library, and so destroyed after them.
[[gnu::init_priority(101)]] Factory factory;

}  // namespace

IInterface* InterfaceFactory::CreateInterface(const char* name) {
    if (CompareInterface(name, "IProtocolFactory") || CompareInterface(name, "ProtocolFactory"))
        return &factory.protocols;
    if (CompareInterface(name, "IProtModule") || CompareInterface(name, "ProtModule"))
        return &factory.module;
    return nullptr;
}

void InterfaceFactory::ReleaseInterface(IInterface* /*held*/) {}

void* ProtocolFactory::ConvertTo(const char* name) {
    if (CompareInterface(name, "ProtocolFactory")) return this;
    return IProtocolFactory::ConvertTo(name);
}

IProtocol* ProtocolFactory::CreateProtocol(const char* name) {
    if (!CompareInterface(name, "MRTU")) return nullptr;
    return guarded(
        static_cast<IProtocol*>(nullptr), [] {}, CreateProtocol_MRTU);
}

void ProtocolFactory::DeleteProtocol(IProtocol* protocol) {
    delete protocol;
}

extern "C" IInterfaceFactory* GetInterfaceFactory() {
    return &factory.interfaces;
}
