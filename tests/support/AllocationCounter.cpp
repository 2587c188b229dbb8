#include "tests/support/AllocationCounter.h"

#include <cstdlib>
#include <new>

namespace {

thread_local std::size_t allocated = 0;
thread_local std::size_t released = 0;

void* take(std::size_t size) {
    ++allocated;
    if (void* memory = std::malloc(size == 0 ? 1 : size)) return memory;
    throw std::bad_alloc();
}

// The sanitizers' own forms would take what the operators below do not give back.
void* takeOrNull(std::size_t size) {
    ++allocated;
    return std::malloc(size == 0 ? 1 : size);
}

void* takeAligned(std::size_t size, std::align_val_t alignment) {
    ++allocated;
    const auto step = static_cast<std::size_t>(alignment);
    if (void* memory = std::aligned_alloc(step, (size + step - 1) / step * step)) return memory;
    throw std::bad_alloc();
}

void give(void* memory) {
    if (memory != nullptr) ++released;
    std::free(memory);
}

}  // namespace

void* operator new(std::size_t size) {
    return take(size);
}
void* operator new[](std::size_t size) {
    return take(size);
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return takeOrNull(size);
}
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return takeOrNull(size);
}
void* operator new(std::size_t size, std::align_val_t alignment) {
    return takeAligned(size, alignment);
}
void* operator new[](std::size_t size, std::align_val_t alignment) {
    return takeAligned(size, alignment);
}
void operator delete(void* memory) noexcept {
    give(memory);
}
void operator delete[](void* memory) noexcept {
    give(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    give(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    give(memory);
}
void operator delete(void* memory, std::align_val_t) noexcept {
    give(memory);
}
void operator delete[](void* memory, std::align_val_t) noexcept {
    give(memory);
}
void operator delete(void* memory, std::size_t, std::align_val_t) noexcept {
    give(memory);
}
void operator delete[](void* memory, std::size_t, std::align_val_t) noexcept {
    give(memory);
}

namespace testing_support {

AllocationCounter::AllocationCounter() : allocationsBefore_(allocated), releasesBefore_(released) {}

std::size_t AllocationCounter::allocations() const {
    return allocated - allocationsBefore_;
}

std::size_t AllocationCounter::releases() const {
    return released - releasesBefore_;
}

}  // namespace testing_support
