#include "tests/support/MemoryShortage.h"

#include <cstddef>
#include <cstdlib>
#include <limits>
#include <new>

namespace {

constexpr int kNoLimit = std::numeric_limits<int>::max();

// Requests that are still granted.
thread_local int granted = kNoLimit;

bool grant() {
    if (granted <= 0) return false;
    if (granted != kNoLimit) --granted;
    return true;
}

}  // namespace

// The linker turns the program's own calls of malloc() into calls of the first one (--wrap).
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" void* __real_malloc(std::size_t size);
extern "C" void* __wrap_malloc(std::size_t size) {
    return grant() ? __real_malloc(size) : nullptr;
}

namespace {

void* take(std::size_t size) {
    return grant() ? __real_malloc(size == 0 ? 1 : size) : nullptr;
}

}  // namespace
// NOLINTEND(bugprone-reserved-identifier)

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
