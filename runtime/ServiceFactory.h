// The interface factory that a plug-in's module takes the host's services from.
#pragma once

#include <mutex>
#include <string>
#include <vector>

#include "platform/HostServices.h"
#include "platform/IInterfaceFactory.h"
#include "platform/IMultiTask2.h"
#include "platform/IPermanentStorage.h"
#include "platform/ISerialFactory.h"

namespace runtime {

/// Serves "IMultiTask2", "ISerialFactory", "ISocketFactory" and "ICDSBuffer", and
/// "IPermanentStorage" where there is one; every other name gets null. The services belong to the
/// caller and must outlive this object; the socket factory and the data buffer, which drivers only
/// hold, are its own.
/// Threads: any.
class ServiceFactory final : public IInterfaceFactory {
  public:
    /// @param storage  Null for a host without permanent storage.
    ServiceFactory(IMultiTask2& multiTask, ISerialFactory& serial,
                   IPermanentStorage* storage = nullptr);
    ~ServiceFactory() = default;
    ServiceFactory(const ServiceFactory&) = delete;
    ServiceFactory& operator=(const ServiceFactory&) = delete;

    IInterface* CreateInterface(const char* name) override;
    void ReleaseInterface(IInterface* held) override;

    /// References handed out and not yet handed back: 0 after the module's last Close().
    int outstanding() const;
    /// The same for one service.
    int outstanding(const std::string& name) const;
    /// Hand-backs of something that was not held.
    int strayReleases() const;

  private:
    struct Service {
        std::string name;
        IInterface* object;
        int held;
    };

    class Sockets final : public ISocketFactory {
      public:
        void* ConvertTo(const char* name) override;
        const char* GetImpName() const override { return "runtime::Sockets"; }
        int GetImpVersion() const override { return 100; }
    };
    class DataBuffer final : public ICDSBuffer {
      public:
        void* ConvertTo(const char* name) override;
        const char* GetImpName() const override { return "runtime::DataBuffer"; }
        int GetImpVersion() const override { return 100; }
    };

    Sockets sockets_;
    DataBuffer dataBuffer_;
    mutable std::mutex mutex_;
    std::vector<Service> services_;
    int strayReleases_ = 0;
};

}  // namespace runtime
