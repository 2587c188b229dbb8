// The module object: it takes the host's services into the process-wide pointers.
#pragma once

#include <cstdint>

#include "platform/IProtModule.h"

/// Counts its users: the services are taken by the first Init() and handed back by the last
/// Close(). At unload the destructor closes once more, in case the host forgot to.
class ProtModule final : public IProtModule {
  public:
    ProtModule() = default;
    ~ProtModule() override;
    ProtModule(const ProtModule&) = delete;
    ProtModule& operator=(const ProtModule&) = delete;

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "ProtModule"; }
    int GetImpVersion() const override { return 100; }
    int Init(IInterfaceFactory* host) override;
    void Close() override;
    const char* GetLastError() const override { return lastError_; }

  private:
    const char* lastError_ = "";  ///< A fixed text: a failure needs no memory.
    IInterfaceFactory* host_ = nullptr;
    std::uint32_t initCount_ = 0;
};
