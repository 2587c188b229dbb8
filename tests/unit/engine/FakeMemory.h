// One memory area of a device as an array, for a driver that plays.
#pragma once

#include <cstddef>
#include <vector>

#include "framework/MemoryManager.h"

/// 65536 items in host byte order, filled with numbers that look random and are the same each time.
/// Bits are packed, least significant first.
class FakeMemory {
  public:
    explicit FakeMemory(const MemoryType& type);

    const MemoryType& type() const { return type_; }
    bool isBits() const { return bits_; }
    int itemLength() const { return itemLength_; }
    const std::vector<unsigned char>& image() const { return image_; }

    /// Items, or bits from bit `index` % 8 of the buffer on.
    void read(int index, unsigned char* data, int count) const;
    void write(int index, const unsigned char* data, int count);

    /// `length` bytes from item `index` on.
    std::vector<unsigned char> bytes(int index, int length) const;
    void setBytes(int index, const std::vector<unsigned char>& bytes);
    /// Bit `number` of the whole area, 0 or 1.
    unsigned char bit(int number) const;
    void setBit(int number, unsigned char value);

  private:
    std::ptrdiff_t firstByteOf(int index) const;

    MemoryType type_;
    bool bits_;
    int itemLength_;
    std::vector<unsigned char> image_;
};
