// The generic engine between the framework's protocol base and a driver: it cuts tag accesses into
// blocks that one request can carry and calls the driver's hooks.
#pragma once

#include <cstdint>

#include "engine/ProtgenTag.h"
#include "engine/WriteTurns.h"
#include "framework/ProtocolBase.h"

/// Any data type that a memory accepts works at any length: the engine reads and writes whole
/// items of the memory. A write that covers only part of an item reads it first, changes the tag's
/// bits and writes it back. Meanwhile it keeps other writers out of that memory of that configured
/// node, so that two threads writing different bits of one register lose no update, and no whole
/// write is undone; other writes wait for nobody at all. When such a read fails nothing is written.
/// Addresses in front of, or behind the memory type's index range, lengths below 1 and writes to a
/// read-only memory are refused with -1 before anything is sent. What a failed read would have
/// stored is not stored, whichever of its requests failed; a failed write leaves the blocks in
/// front of the failed one written.
/// Every ITag that comes in was made by CreateTagBase() of the same object.
/// Threads: reads and writes may run concurrently when the driver's hooks may.
class ProtgenProtocol : public ProtocolBase {
  public:
    ProtgenProtocol();

    bool CanBeOptimized(const ITag* a, const ITag* b, bool write) const override;
    int Write(const ITag* tag, const unsigned char* value) override;
    int ReadBlock(const ITag* tag, unsigned char* data, int length) override;
    int WriteBlock(const ITag* tag, const unsigned char* data, int length) override;
    int MaxDatagramItems(const ITag* tag) const override;
    int MaxDatagramLength(const ITag* tag) const override;
    bool CanCoexistInDatagram(const ITag* a, const ITag* b) const override;
    int ReadDatagram(const ITag* const* tags, int count, unsigned char* data) override;
    bool CanAddToDatagram(const ITag* const* tags, int count, const ITag* candidate) override;
    int ReadDatagramWithStatus(const ITag* const* tags, int count, unsigned char* data,
                               idal_error_t* status) override;
    int GetNodeID(const ITag* tag) const override;
    bool CanReadBitBlock(const ITag* tag) const override;
    int ReadBitBlock(const ITag* tag, unsigned char* data, int bits) override;
    bool IsBefore(const ITag* a, const ITag* b) const override;
    bool NeedsReadBeforeWrite(const ITag* tag) const override;
    bool CanWriteBitBlock(const ITag* tag) const override;
    int WriteBitBlock(const ITag* tag, const unsigned char* data, int bits) override;
    int readArrayItem(const ITag* tag, int index, unsigned char* value) override;
    int writeArrayItem(const ITag* tag, int index, const unsigned char* value) override;

    // The driver's hooks, in table order behind tagUriNames(). Only the engine calls them. `index`
    // is the address of the first item (or bit) and `count` the number of items (or bits).

    /// @return the most items that one request can carry for the tag's memory.
    virtual int getMaxItemCount(const ProtgenTag* tag, bool write) const = 0;
    /// @return the most bits of one bit request; unless overridden, getMaxItemCount().
    virtual int getMaxBitCount(const ProtgenTag* tag, bool write) const;
    /// @return non-zero when array items are addressed through the tag: item n of an array is
    /// reached as the memory items that hold it.
    virtual int arrayItemByTag() const;
    /// Writes items from `data`, host byte order, or bits from bit `index` % 8 of `data` on.
    /// @return non-zero on success.
    virtual int doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) = 0;
    /// Reads items into `data`, host byte order, or bits into bit `index` % 8 of `data` on.
    virtual bool doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) = 0;
    virtual int doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                            int count) = 0;
    virtual bool doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) = 0;
    /// Unless overridden, refuses.
    virtual bool doReadDatagram(const ProtgenTag* const* tags, int count, unsigned char* data,
                                idal_error_t* status);

  private:
    int readBits(const ProtgenTag& tag, unsigned char* data, std::int64_t count);
    bool readItems(const ProtgenTag& tag, int address, unsigned char* data, int count);
    int writeBits(const ProtgenTag& tag, const unsigned char* data, std::int64_t count);
    bool writeItems(const ProtgenTag& tag, int address, const unsigned char* data, int count);
    bool itemsAreAddressed(const ProtgenTag& tag, bool write) const;
    int requestLimit(const ProtgenTag& tag, int count, bool write) const;
    bool refuseWrite(const ProtgenTag& tag, std::int64_t items);
    bool refuse(const char* fault);
    int fail(int code, const char* text);

    engine::WriteTurns writeTurns_;
};
