// The plug-in's module object: it takes the host's services and gives them back.
#pragma once

#include "platform/IInterfaceFactory.h"

/// Threads: Init() and Close() come from one thread, before and after any protocol object runs.
class IProtModule : public IInterface {
  public:
    /// Takes the host's services out of `host`. Calls are counted: only the first takes them.
    /// @return 1 on success; 0 when `host` is null or a required service is missing (GetLastError()
    /// says which) and everything taken so far has been handed back.
    virtual int Init(IInterfaceFactory* host) = 0;
    /// Undoes one successful Init(); the last one hands the services back.
    virtual void Close() = 0;
    /// @return the last failure of Init(), empty before the first; valid until the next Init().
    virtual const char* GetLastError() const = 0;
};
