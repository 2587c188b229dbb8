// A driver of a protocol called "FAKE", wrong in the way that FAKE_DRIVER_KIND names.
//
// Tags are 2 bytes long and hold what was last written. The URI "bad" is refused. Started objects
// alone can be read. The protocol "THROWS" fails in its making.
#include <cstring>
#include <stdexcept>
#include <string>

#include "platform/IProtModule.h"
#include "platform/IProtocol.h"
#include "platform/IProtocolFactory.h"

namespace {

bool kindIs(const char* kind) {
    return std::strcmp(FAKE_DRIVER_KIND, kind) == 0;
}

class FakeTag final : public ITag {
  public:
    ITag* Clone() const override { return new FakeTag(*this); }
    unsigned int GetByteOffset() const override { return 0; }
    int GetBitIndex() const override { return 0; }
    const char* GetVarName() const override { return "fake"; }
    ICU_Type GetVarType() const override { return ICU_Type::unsignedShort; }
    int GetVarLength() const override { return 2; }
    ICU_Type GetItemType() const override { return ICU_Type::none; }
    int PackedLen() const override { return 2; }
    bool ConvertVariable(const unsigned char*, unsigned char*, bool) const override { return true; }
    bool IsReadOnly() const override { return false; }
    bool IsWriteOnly() const override { return false; }
    bool Convert(const unsigned char*, unsigned char*, bool) const override { return true; }
    bool DoConversion(unsigned char*, const char*, bool) const override { return true; }
};

class FakeProtocol final : public IProtocol2 {
  public:
    void* ConvertTo(const char* name) override {
        const bool mine =
            CompareInterface(name, "IProtocol") || CompareInterface(name, "IProtocol2");
        return mine ? this : nullptr;
    }
    const char* GetImpName() const override { return "FakeProtocol"; }
    int GetImpVersion() const override { return 100; }
    int Config(const char* text) override {
        return std::strcmp(text, "good") == 0 ? 1 : refuse(-1, "bad configuration");
    }
    ITag* CreateTag(const char* uri) override {
        if (std::strcmp(uri, "bad") != 0) return new FakeTag;
        refuse(-1, "bad tag");
        return nullptr;
    }
    void FreeTag(ITag* tag) override { delete tag; }
    bool CanBeOptimized(const ITag*, const ITag*, bool) const override { return false; }
    int Start() override { return started_ = 1; }
    int Stop() override {
        started_ = 0;
        return 1;
    }
    int Read(const ITag*, unsigned char* value) override {
        if (started_ == 0) return refuse(-3, "Protocol not started");
        std::memcpy(value, value_, sizeof value_);
        return 1;
    }
    int Write(const ITag*, const unsigned char* value) override {
        if (started_ == 0) return refuse(-3, "Protocol not started");
        std::memcpy(value_, value, sizeof value_);
        return 1;
    }
    int ReadBlock(const ITag*, unsigned char*, int) override { return 0; }
    int WriteBlock(const ITag*, const unsigned char*, int) override { return 0; }
    int MaxDatagramItems(const ITag*) const override { return 0; }
    int MaxDatagramLength(const ITag*) const override { return 0; }
    bool CanCoexistInDatagram(const ITag*, const ITag*) const override { return false; }
    int ReadDatagram(const ITag* const*, int, unsigned char*) override { return 0; }
    const char* GetName() const override { return "FAKE"; }
    const char* GetNextInstanceName() const override { return "FAKE"; }
    int GetLastError() const override { return code_; }
    const char* GetLastErrorString() const override { return text_.c_str(); }
    int GetProtocolVersion() const override { return 1; }
    int GetProtocolType() const override { return 1; }
    const char* GetProtocolName() const override { return "Fake"; }
    int GetInfo(char*, int) const override { return 0; }
    const unsigned char* GetXml() const override { return nullptr; }
    bool IsConverted() const override { return false; }
    const char* GetIdent() const override { return ident_.c_str(); }
    void SetIdent(const char* ident) override { ident_ = ident; }
    int DoCommand(const char* command, char* answer, int size) override {
        if (std::strcmp(command, "count") != 0) return 0;
        std::strncpy(answer, "0123456789", static_cast<std::size_t>(size));
        return 1;
    }
    int Extend(int, void*) override { return 0; }

  private:
    int refuse(int code, const char* text) {
        code_ = code;
        text_ = text;
        return 0;
    }

    int started_ = 0;
    int code_ = 1;
    std::string text_;
    std::string ident_;
    unsigned char value_[2] = {};
};

class FakeModule final : public IProtModule {
  public:
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "IProtModule") ? this : nullptr;
    }
    const char* GetImpName() const override { return "FakeModule"; }
    int GetImpVersion() const override { return 100; }
    int Init(IInterfaceFactory* host) override {
        if (kindIs("init_fails")) return 0;
        host_ = host;
        held_ = host->CreateInterface("IMultiTask2");
        return 1;
    }
    void Close() override { host_->ReleaseInterface(held_); }
    const char* GetLastError() const override { return "the moon is not full"; }

  private:
    IInterfaceFactory* host_ = nullptr;
    IInterface* held_ = nullptr;
};

class FakeProtocolFactory final : public IProtocolFactory {
  public:
    const char* GetImpName() const override { return "FakeProtocolFactory"; }
    int GetImpVersion() const override { return 100; }
    IProtocol* CreateProtocol(const char* name) override {
        if (std::strcmp(name, "THROWS") == 0) throw std::runtime_error("no");
        return std::strcmp(name, "FAKE") == 0 ? new FakeProtocol : nullptr;
    }
    void DeleteProtocol(IProtocol* protocol) override { delete protocol; }
};

class FakeFactory final : public IInterfaceFactory {
  public:
    IInterface* CreateInterface(const char* name) override {
        if (CompareInterface(name, "IProtModule") && !kindIs("no_module")) return &module_;
        if (CompareInterface(name, "IProtocolFactory") && !kindIs("no_protocol_factory")) {
            return &protocols_;
        }
        return nullptr;
    }
    void ReleaseInterface(IInterface*) override {}

  private:
    FakeModule module_;
    FakeProtocolFactory protocols_;
};

FakeFactory theFactory;

}  // namespace

extern "C" IInterfaceFactory* GetInterfaceFactory();
extern "C" IInterfaceFactory* GetInterfaceFactory() {
    return &theFactory;
}
