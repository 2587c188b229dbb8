#include "tests/support/MemoryShortage.h"

#include <cstddef>
#include <cstdlib>
#include <limits>
#include <new>

namespace {

constexpr int kNoLimit = std::numeric_limits<int>::max();

// Requests that are still granted.
thread_local int granted = kNoLimit;

void* take(std::size_t size) {
    if (granted <= 0) return nullptr;
    if (granted != kNoLimit) --granted;
    return std::malloc(size == 0 ? 1 : size);
}

}  // namespace

void* operator new(std::size_t size) {
    if (void* memory = take(size)) return memory;
    throw std::bad_alloc();
}
void* operator new[](std::size_t size) {
    return operator new(size);
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return take(size);
}
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return take(size);
}
void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete[](void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace testing_support {

MemoryShortage::MemoryShortage(int requests) {
    granted = requests;
}

MemoryShortage::~MemoryShortage() {
    granted = kNoLimit;
}

}  // namespace testing_support
