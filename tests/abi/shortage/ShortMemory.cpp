#include "tests/abi/shortage/ShortMemory.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <new>

namespace shortage {

namespace {

constexpr long kOff = -1;

long requestsLeft = kOff;  // granted until the refused one; kOff grants all
bool lasting = false;
long refusedCount = 0;
int suspended = 0;
long alive = 0;
std::size_t largest = 0;

/// @return whether the request is granted.
bool grant(std::size_t size) {
    if (suspended > 0) return true;
    largest = std::max(largest, size);
    if (requestsLeft == kOff) return true;
    if (requestsLeft > 0) {
        --requestsLeft;
        return true;
    }
    if (!lasting) requestsLeft = kOff;
    ++refusedCount;
    errno = ENOMEM;
    return false;
}

void* entered(void* memory) {
    if (memory != nullptr) ++alive;
    return memory;
}

}  // namespace

Refusal::Refusal(long nth, Kind kind) {
    refusedCount = 0;
    lasting = kind == Kind::lasting;
    requestsLeft = nth - 1;
}

Refusal::~Refusal() {
    requestsLeft = kOff;
}

long Refusal::refused() {
    return refusedCount;
}

Plenty::Plenty() {
    ++suspended;
}

Plenty::~Plenty() {
    --suspended;
}

long blocksAlive() {
    return alive;
}

std::size_t largestRequest() {
    return largest;
}

void forgetLargest() {
    largest = 0;
}

}  // namespace shortage

#ifndef MRTU_SANITIZED

using shortage::alive;
using shortage::entered;
using shortage::grant;

extern "C" {

// The C library's own, under the names that it keeps for those who stand in front of it.
void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* memory, std::size_t size);
void* __libc_memalign(std::size_t alignment, std::size_t size);
void __libc_free(void* memory);

void* malloc(std::size_t size) noexcept {
    return grant(size) ? entered(__libc_malloc(size)) : nullptr;
}

void* calloc(std::size_t count, std::size_t size) noexcept {
    return grant(count * size) ? entered(__libc_calloc(count, size)) : nullptr;
}

void* realloc(void* memory, std::size_t size) noexcept {
    if (!grant(size)) return nullptr;
    return memory == nullptr ? entered(__libc_realloc(memory, size)) : __libc_realloc(memory, size);
}

void* memalign(std::size_t alignment, std::size_t size) noexcept {
    return grant(size) ? entered(__libc_memalign(alignment, size)) : nullptr;
}

void* aligned_alloc(std::size_t alignment, std::size_t size) noexcept {
    return memalign(alignment, size);
}

int posix_memalign(void** memory, std::size_t alignment, std::size_t size) noexcept {
    void* const taken = memalign(alignment, size);
    if (taken == nullptr) return ENOMEM;
    *memory = taken;
    return 0;
}

void free(void* memory) noexcept {
    if (memory != nullptr) --alive;
    __libc_free(memory);
}

}  // extern "C"

#else

namespace {

void* take(std::size_t size) {
    return shortage::grant(size) ? shortage::entered(std::malloc(size == 0 ? 1 : size)) : nullptr;
}

void give(void* memory) {
    if (memory != nullptr) --shortage::alive;
    std::free(memory);
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

#endif
