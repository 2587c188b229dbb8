// How host and plug-in fetch each other's interfaces.
#pragma once

#include "platform/IInterface.h"

/// Hands out interfaces by exact name. The host implements one (its services) and the plug-in
/// implements one (its entry objects); the two operations below are its whole table.
class IInterfaceFactory {
  public:
    /// @return the interface called `name`, or null when there is none. What it points to belongs
    /// to the factory; hand it back with ReleaseInterface().
    virtual IInterface* CreateInterface(const char* name) = 0;

    /// Hands back what CreateInterface() returned.
    virtual void ReleaseInterface(IInterface* held) = 0;

  protected:
    // Not virtual: a destructor in the table would shift the two operations.
    ~IInterfaceFactory() = default;
};

/// The one C entry of a driver plug-in, `GetInterfaceFactory`. The factory is static: it is ready
/// when the library has been loaded and lives until the library is unloaded.
using GetInterfaceFactoryFunction = IInterfaceFactory* (*)();
