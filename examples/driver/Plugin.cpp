// What makes a library a driver: the entry GetInterfaceFactory and the two objects behind it.
#include "Memo.h"
#include "platform/IProtocolFactory.h"
#include "plugin/ProtModule.h"

namespace {

class Protocols final : public IProtocolFactory {
  public:
    const char* GetImpName() const override { return "memo::Protocols"; }
    int GetImpVersion() const override { return 100; }
    IProtocol* CreateProtocol(const char* name) override {
        return CompareInterface(name, "MEMO") ? new memo::Memo : nullptr;
    }
    void DeleteProtocol(IProtocol* protocol) override { delete protocol; }
};

class Entry final : public IInterfaceFactory {
  public:
    IInterface* CreateInterface(const char* name) override {
        if (CompareInterface(name, "IProtocolFactory")) return &protocols_;
        if (CompareInterface(name, "IProtModule")) return &module_;
        return nullptr;
    }
    void ReleaseInterface(IInterface* /*held*/) override {}

  private:
    Protocols protocols_;
    // Takes the host's services into the nine pointers; both come from mrtu::module.
    ProtModule module_;
};

Entry entry;

}  // namespace

// Visible, whatever visibility the driver is compiled with; so are the pointers of mrtu::module.
extern "C" [[gnu::visibility("default")]] IInterfaceFactory* GetInterfaceFactory() {
    return &entry;
}
