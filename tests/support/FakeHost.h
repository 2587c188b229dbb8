// A host: it hands out fake services by name and keeps the books.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/HostServices.h"
#include "platform/IInterfaceFactory.h"
#include "tests/support/FakeMultiTask.h"
#include "tests/support/FakeStorage.h"
#include "tests/support/RecordingSerialFactory.h"

namespace testing_support {

/// A service that a driver only holds.
template <class Service>
class HeldService final : public Service {
  public:
    explicit HeldService(const char* name) : name_(name) {}
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, name_) ? static_cast<Service*>(this) : nullptr;
    }
    const char* GetImpName() const override { return name_; }
    int GetImpVersion() const override { return 1; }

  private:
    const char* name_;
};

/// Offers all nine services unless told otherwise. The test fails when something is released that
/// is not held.
class FakeHost final : public IInterfaceFactory {
  public:
    FakeHost();
    virtual ~FakeHost() = default;
    FakeHost(const FakeHost&) = delete;
    FakeHost& operator=(const FakeHost&) = delete;

    FakeMultiTask multiTask;
    RecordingSerialFactory serialFactory;
    StorageContents stored;
    FakeStorage storage{stored};
    PlainFakeStorage plainStorage{stored};

    /// From now on CreateInterface(name) gives null.
    void withhold(const std::string& name) { withheld_.insert(name); }
    void offerAgain(const std::string& name) { withheld_.erase(name); }
    /// The storage is then one without the copying reads.
    void offerPlainStorage() { offered_["IPermanentStorage"] = &plainStorage; }
    /// Puts another object in a service's place; the test owns it.
    void offer(const std::string& name, IInterface& service) { offered_[name] = &service; }

    /// "create IMultiTask2", "release IMultiTask2", in order; refused requests are in it too.
    const std::vector<std::string>& calls() const { return calls_; }
    void forget() { calls_.clear(); }
    int created(const std::string& name) const;
    int released(const std::string& name) const;
    /// Services handed out and not yet handed back.
    int held() const;
    IInterface* service(const std::string& name) const { return offered_.at(name); }

    IInterface* CreateInterface(const char* name) override;
    void ReleaseInterface(IInterface* service) override;

  private:
    HeldService<ISocketFactory> socketFactory_{"ISocketFactory"};
    HeldService<ICDSBuffer> cdsBuffer_{"ICDSBuffer"};
    HeldService<IDiag> diag_{"IDiag"};
    HeldService<IDriverInterface> driverInterface_{"IDriverInterface"};
    HeldService<ISmux> smux_{"ISmux"};
    HeldService<IFastTimer> fastTimer_{"IFastTimer"};

    std::map<std::string, IInterface*> offered_;
    std::set<std::string> withheld_;
    std::map<std::string, int> held_;
    std::vector<std::string> calls_;
};

}  // namespace testing_support
