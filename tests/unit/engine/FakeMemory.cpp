#include "tests/unit/engine/FakeMemory.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "framework/DataTypes.h"

namespace {

constexpr int kItems = 65536;

std::size_t at(int number) {
    return static_cast<std::size_t>(number);
}

}  // namespace

FakeMemory::FakeMemory(const MemoryType& type)
    : type_(type),
      bits_(ProtUtilsN::IsBitType(type.getNaturalType())),
      itemLength_(bits_ ? 1 : ProtUtilsN::GetDataLength(type.getNaturalType())),
      image_(at(bits_ ? kItems / 8 : kItems * itemLength_)) {
    std::uint32_t state = 12345;
    for (unsigned char& byte : image_) {
        state = state * 1664525U + 1013904223U;
        byte = static_cast<unsigned char>(state >> 24);
    }
}

std::ptrdiff_t FakeMemory::firstByteOf(int index) const {
    return static_cast<std::ptrdiff_t>(index) * itemLength_;
}

void FakeMemory::read(int index, unsigned char* data, int count) const {
    if (!bits_) {
        std::copy_n(image_.begin() + firstByteOf(index), count * itemLength_, data);
        return;
    }
    for (int i = 0; i < count; ++i) {
        const int target = index % 8 + i;
        const unsigned mask = 1U << (target % 8);
        const unsigned kept = data[target / 8] & ~mask;
        data[target / 8] = static_cast<unsigned char>(bit(index + i) != 0 ? kept | mask : kept);
    }
}

void FakeMemory::write(int index, const unsigned char* data, int count) {
    if (!bits_) {
        std::copy_n(data, count * itemLength_, image_.begin() + firstByteOf(index));
        return;
    }
    for (int i = 0; i < count; ++i) {
        const int source = index % 8 + i;
        const bool on = (data[source / 8] >> (source % 8) & 1) != 0;
        setBit(index + i, on ? 1 : 0);
    }
}

std::vector<unsigned char> FakeMemory::bytes(int index, int length) const {
    const auto first = image_.begin() + firstByteOf(index);
    return {first, first + length};
}

void FakeMemory::setBytes(int index, const std::vector<unsigned char>& bytes) {
    std::copy(bytes.begin(), bytes.end(), image_.begin() + firstByteOf(index));
}

unsigned char FakeMemory::bit(int number) const {
    return image_[at(number / 8)] >> (number % 8) & 1;
}

void FakeMemory::setBit(int number, unsigned char value) {
    const unsigned mask = 1U << (number % 8);
    unsigned char& byte = image_[at(number / 8)];
    byte = static_cast<unsigned char>(value != 0 ? byte | mask : byte & ~mask);
}
