// The plug-in's maker of protocol objects.
#pragma once

#include "platform/IInterface.h"

class IProtocol;

class IProtocolFactory : public IInterface {
  public:
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "IProtocolFactory") ? this : nullptr;
    }

    /// @return a new protocol object for the protocol called `name`, owned by the caller until
    /// DeleteProtocol(), or null when this plug-in has no such protocol or there is no memory for
    /// it; nothing is left behind then.
    /// REQUIRES: IProtModule::Init() succeeded.
    virtual IProtocol* CreateProtocol(const char* name) = 0;
    /// Destroys a protocol object with the tags it still owns. Null is ignored.
    virtual void DeleteProtocol(IProtocol* protocol) = 0;
};
