// What the engine does when there is no memory for more than one request: an error, nothing sent,
// nothing thrown.
//
// This program replaces the global operator new by one that refuses when told.
#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <limits>
#include <new>
#include <vector>

#include "tests/unit/engine/FakeDriver.h"

namespace {

constexpr int kNever = std::numeric_limits<int>::max();

// Requests for memory that are still granted.
thread_local int granted = kNever;

void* take(std::size_t size) {
    if (granted <= 0) return nullptr;
    if (granted != kNever) --granted;
    return std::malloc(size == 0 ? 1 : size);
}

// Not inlined: the compiler would see a free() of what came from operator new, and object.
[[gnu::noinline]] void give(void* memory) {
    std::free(memory);
}

class Shortage : public testing::Test {
  protected:
    Shortage() { driver_.setLogging(false); }

    /// Runs `access` with ever more memory until it succeeds; each failure must be the clear one,
    /// with nothing sent.
    template <class Access>
    void expectClearFailures(const char* what, int failures, Access access) {
        int calls = 0;
        driver_.onCall([&calls] { ++calls; });
        for (int memory = 0; memory < failures; ++memory) {
            granted = memory;
            const int done = access();
            granted = kNever;
            EXPECT_EQ(done, 0) << what << " with " << memory;
            EXPECT_EQ(driver_.GetLastError(), -1) << what << " with " << memory;
            EXPECT_STREQ(driver_.GetLastErrorString(), "Out of memory") << what;
            EXPECT_EQ(calls, 0) << what << " with " << memory;
        }
        EXPECT_NE(access(), 0) << what;
    }

    FakeDriver driver_;
    std::array<unsigned char, 5000> value_{};
};

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

TEST_F(Shortage, LongReadsAreRefused) {
    const ITag* registers = driver_.tag("1?REG?0?short-400");
    expectClearFailures("ReadBlock", 1,
                        [&] { return driver_.ReadBlock(registers, value_.data(), 800); });
    const ITag* coils = driver_.tag("1?COIL?0?boolean-4000");
    expectClearFailures("ReadBitBlock", 1,
                        [&] { return driver_.ReadBitBlock(coils, value_.data(), 4000); });
}

TEST_F(Shortage, LongWritesAreRefused) {
    const ITag* registers = driver_.tag("1?REG?0?short-400");
    expectClearFailures("Write", 1, [&] { return driver_.Write(registers, value_.data()); });
    expectClearFailures("WriteBlock", 1,
                        [&] { return driver_.WriteBlock(registers, value_.data(), 801); });
}

TEST_F(Shortage, ItemsOfLongArraysAreRefused) {
    const ITag* array = driver_.tag("1?REG?0?short-400");
    expectClearFailures("readArrayItem", 2,
                        [&] { return driver_.readArrayItem(array, 7, value_.data()); });
    expectClearFailures("writeArrayItem", 2,
                        [&] { return driver_.writeArrayItem(array, 7, value_.data()); });
}

TEST_F(Shortage, DatagramsAreRefused) {
    const std::vector<const ITag*> tags = {driver_.tag("1?REG?0?short")};
    for (int memory = 0; memory < 2; ++memory) {
        granted = memory;
        const int done = driver_.ReadDatagram(tags.data(), 1, value_.data());
        granted = kNever;
        EXPECT_EQ(done, 0);
        EXPECT_STREQ(driver_.GetLastErrorString(), "Out of memory") << memory;
    }
}

TEST_F(Shortage, OneRequestNeedsNoMemory) {
    const ITag* tag = driver_.tag("1?REG?0?string-63");
    granted = 0;
    const int done = driver_.Read(tag, value_.data()) & driver_.Write(tag, value_.data());
    granted = kNever;
    EXPECT_NE(done, 0);
}
