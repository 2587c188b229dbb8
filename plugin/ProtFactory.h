// The plug-in's entry and the static objects behind it.
#pragma once

#include "platform/IInterfaceFactory.h"
#include "platform/IProtocolFactory.h"

/// Hands out the plug-in's two static objects by name; nothing is allocated.
class InterfaceFactory final : public IInterfaceFactory {
  public:
    /// Knows "IProtocolFactory", "ProtocolFactory", "IProtModule" and "ProtModule".
    IInterface* CreateInterface(const char* name) override;
    /// Does nothing: the objects are static.
    void ReleaseInterface(IInterface* held) override;
};

/// Makes the one protocol of this plug-in, "MRTU".
class ProtocolFactory final : public IProtocolFactory {
  public:
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "ProtFactoryInDLL"; }
    int GetImpVersion() const override { return 100; }
    IProtocol* CreateProtocol(const char* name) override;
    void DeleteProtocol(IProtocol* protocol) override;
};

/// The one C entry. The factory is ready before any other code of the library runs.
extern "C" IInterfaceFactory* GetInterfaceFactory();
