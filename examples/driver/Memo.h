// A driver that needs no device: it keeps what is written to it. The smallest one that still reads
// and writes every data type, arrays, single bits and items that are longer than a request.
#pragma once

#include <array>
#include <cstdint>
#include <mutex>

#include "engine/ProtgenProtocol.h"
#include "framework/MemoryManager.h"

namespace memo {

/// One area, CELL, of 1000 cells of 16 bits. URI: memorytype?arrayindex.subindex?datatype, e.g.
/// CELL?10?unsignedShort, CELL?10.3?boolean, CELL?500?float-20.
/// Threads: reads and writes may come at the same time.
class Memo final : public ProtgenProtocol {
  public:
    static constexpr int kCells = 1000;

    Memo();
    ~Memo() override;

    const char* GetImpName() const override { return "Memo"; }
    int GetImpVersion() const override { return 100; }
    const char* GetName() const override { return "MEMO"; }
    int GetProtocolVersion() const override { return 100; }
    int GetProtocolType() const override { return 0; }
    const char* GetProtocolName() const override { return "Memory cells"; }
    int Config(const char* text) override;

    ITag* CreateTagBase(const char* uri) override;
    int GetMaxTm(const ITag* tag) const override;
    const char* const* tagUriNames() const override;

    int getMaxItemCount(const ProtgenTag* tag, bool write) const override;
    bool doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) override;
    int doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) override;
    bool doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) override;
    int doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                    int count) override;

  private:
    ITag* refuse(const char* text);

    MemoryManager memory_;
    std::mutex mutex_;
    std::array<std::uint16_t, kCells> cells_{};
};

}  // namespace memo
