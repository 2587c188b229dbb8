// What the engine does when there is no memory for more than one request: an error, nothing sent,
// nothing thrown.
#include <gtest/gtest.h>

#include <array>
#include <vector>

#include "tests/support/MemoryShortage.h"
#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using testing_support::MemoryShortage;

template <class Access>
int withMemory(int requests, Access access) {
    const MemoryShortage shortage(requests);
    return access();
}

class EngineShortageTest : public testing::Test {
  protected:
    EngineShortageTest() { driver_.setLogging(false); }

    /// Runs `access` with ever more memory until it succeeds; each failure must be the clear one,
    /// with nothing sent.
    template <class Access>
    void expectClearFailures(const char* what, int failures, Access access) {
        int calls = 0;
        driver_.onCall([&calls] { ++calls; });
        for (int memory = 0; memory < failures; ++memory) {
            const int done = withMemory(memory, access);
            EXPECT_EQ(0, done) << what << " with " << memory;
            EXPECT_EQ(-1, driver_.GetLastError()) << what << " with " << memory;
            EXPECT_STREQ("Out of memory", driver_.GetLastErrorString()) << what;
            EXPECT_EQ(0, calls) << what << " with " << memory;
        }
        EXPECT_NE(access(), 0) << what;
    }

    FakeDriver driver_;
    std::array<unsigned char, 5000> value_{};
};

TEST_F(EngineShortageTest, LongReadsAreRefused) {
    const ITag* registers = driver_.tag("1?REG?0?short-400");
    expectClearFailures("ReadBlock", 1,
                        [&] { return driver_.ReadBlock(registers, value_.data(), 800); });
    const ITag* coils = driver_.tag("1?COIL?0?boolean-4000");
    expectClearFailures("ReadBitBlock", 1,
                        [&] { return driver_.ReadBitBlock(coils, value_.data(), 4000); });
}

TEST_F(EngineShortageTest, LongWritesAreRefused) {
    const ITag* registers = driver_.tag("1?REG?0?short-400");
    expectClearFailures("Write", 1, [&] { return driver_.Write(registers, value_.data()); });
    expectClearFailures("WriteBlock", 1,
                        [&] { return driver_.WriteBlock(registers, value_.data(), 801); });
}

TEST_F(EngineShortageTest, ItemsOfLongArraysAreRefused) {
    const ITag* array = driver_.tag("1?REG?0?short-400");
    expectClearFailures("readArrayItem", 2,
                        [&] { return driver_.readArrayItem(array, 7, value_.data()); });
    expectClearFailures("writeArrayItem", 2,
                        [&] { return driver_.writeArrayItem(array, 7, value_.data()); });
}

TEST_F(EngineShortageTest, DatagramsAreRefused) {
    const std::vector<const ITag*> tags = {driver_.tag("1?REG?0?short")};
    for (int memory = 0; memory < 2; ++memory) {
        const int done =
            withMemory(memory, [&] { return driver_.ReadDatagram(tags.data(), 1, value_.data()); });
        EXPECT_EQ(0, done);
        EXPECT_STREQ("Out of memory", driver_.GetLastErrorString()) << memory;
    }
}

TEST_F(EngineShortageTest, OneRequestNeedsNoMemory) {
    const ITag* tag = driver_.tag("1?REG?0?string-63");
    const int done = withMemory(
        0, [&] { return driver_.Read(tag, value_.data()) & driver_.Write(tag, value_.data()); });
    EXPECT_NE(done, 0);
}

}  // namespace
