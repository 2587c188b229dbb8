// A driver under the engine that plays its devices and records what the engine asks of it.
#pragma once

#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <vector>

#include "engine/ProtgenProtocol.h"
#include "tests/unit/engine/FakeMemory.h"

/// Memory types (index range 0..65535 unless noted), in the models "A" and "B":
/// REG 16-bit registers, 125 read, 123 written; IREG the same, read only; LONG 32-bit registers,
/// 62 and 61; BYTE bytes, 200 and 200; COIL bits, 2000 and 1968; SMALL bits, index range 5..14;
/// AREA a 32-bit value of the driver itself; FLAG a bit of the driver itself.
/// It fails the running test when the engine asks for what no device has or no request can carry.
class FakeDriver : public ProtgenProtocol {
  public:
    FakeDriver();

    /// A tag for "node?memory?offset.subindex?type"; fails the test when there is none.
    const ITag* tag(const std::string& uri);
    FakeMemory& memory(const std::string& name) { return memories_.at(name); }
    MemoryManager& manager() { return manager_; }

    /// The hook calls since the last look, e.g. "read 10+125, write 10+1".
    std::string calls();
    /// Lets hook call number `call`, counted from 1 and from now on, fail with -4.
    void failCall(int call);
    /// Runs in each hook call, with no lock held.
    void onCall(std::function<void()> action) { onCall_ = std::move(action); }
    /// What getMaxItemCount() answers instead of the memory type's block count.
    void setLimit(int limit) { limit_ = limit; }
    void setLogging(bool on) { logging_ = on; }
    void setArrayItemByTag(int answer) { arrayItemByTag_ = answer; }

    const char* GetImpName() const override { return "FakeDriver"; }
    int GetImpVersion() const override { return 1; }
    int Config(const char* /*text*/) override { return 1; }
    const char* GetName() const override { return "FAKE"; }
    int GetProtocolVersion() const override { return 1; }
    int GetProtocolType() const override { return 1; }
    const char* GetProtocolName() const override { return "Fake"; }
    ITag* CreateTagBase(const char* uri) override;
    int GetMaxTm(const ITag* /*tag*/) const override { return 0; }
    const char* const* tagUriNames() const override;

    int getMaxItemCount(const ProtgenTag* tag, bool write) const override;
    int arrayItemByTag() const override { return arrayItemByTag_; }
    int doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) override;
    bool doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) override;
    int doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                    int count) override;
    bool doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) override;

  private:
    FakeMemory& reach(const ProtgenTag* tag);
    bool enter(const ProtgenTag* tag, const char* what, int index, int count, bool write);
    void expectPossible(const ProtgenTag* tag, int index, int count, bool write) const;

    MemoryManager manager_;
    std::map<std::string, FakeMemory> memories_;
    std::mutex lineMutex_;
    std::string calls_;
    std::function<void()> onCall_;
    int callsUntilFailure_ = 0;
    int limit_ = -1;
    int arrayItemByTag_ = 1;
    bool logging_ = true;
};
