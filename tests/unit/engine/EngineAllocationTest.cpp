// What one request carries needs no heap.
#include <gtest/gtest.h>

#include <array>

#include "tests/support/AllocationCounter.h"
#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using testing_support::AllocationCounter;

class EngineAllocationTest : public testing::Test {
  protected:
    EngineAllocationTest() { driver_.setLogging(false); }

    FakeDriver driver_;
    std::array<unsigned char, 2000> value_{};
};

}  // namespace

TEST_F(EngineAllocationTest, BlockReadsOfOneRequestTakeNothingFromTheHeap) {
    struct Row {
        const char* uri;
        int length;
    };
    constexpr Row kRows[] = {
        {"1?REG?0?short", 250}, {"1?REG?0?short", 249},         {"1?LONG?0?int", 248},
        {"1?REG?0?byte", 1},    {"1?COIL?3?boolean-1997", 250},
    };
    for (const Row& row : kRows) {
        const ITag* tag = driver_.tag(row.uri);
        const AllocationCounter counter;
        const int done = driver_.ReadBlock(tag, value_.data(), row.length);
        EXPECT_EQ(0U, counter.allocations()) << row.uri << " length " << row.length;
        EXPECT_NE(done, 0) << row.uri;
    }
}

TEST_F(EngineAllocationTest, TagReadsAndWritesOfOneRequestTakeNothingFromTheHeap) {
    for (const char* uri : {"1?REG?0?short", "1?REG?0.5?boolean", "1?REG?0?double-8",
                            "1?REG?0?string-63", "1?LONG?0?float", "1?COIL?3?boolean-100"}) {
        const ITag* tag = driver_.tag(uri);
        const AllocationCounter counter;
        const bool done =
            driver_.Read(tag, value_.data()) != 0 && driver_.Write(tag, value_.data()) != 0;
        EXPECT_EQ(0U, counter.allocations()) << uri;
        EXPECT_TRUE(done) << uri;
    }
}

TEST_F(EngineAllocationTest, BitBlocksAndArrayItemsTakeNothingFromTheHeap) {
    const ITag* coils = driver_.tag("1?COIL?3?boolean-1968");
    const ITag* array = driver_.tag("1?REG?0?short-120(swap4)");
    const AllocationCounter counter;
    const bool bits = driver_.ReadBitBlock(coils, value_.data(), 1968) != 0 &&
                      driver_.WriteBitBlock(coils, value_.data(), 1968) != 0;
    const bool item = driver_.readArrayItem(array, 77, value_.data()) != 0 &&
                      driver_.writeArrayItem(array, 77, value_.data()) != 0;
    EXPECT_EQ(0U, counter.allocations());
    EXPECT_TRUE(bits);
    EXPECT_TRUE(item);
}

TEST_F(EngineAllocationTest, CounterSeesWhatTheHeapGives) {
    const ITag* tag = driver_.tag("1?REG?0?short-300");
    const AllocationCounter counter;
    EXPECT_NE(driver_.ReadBlock(tag, value_.data(), 600), 0);
    EXPECT_GT(counter.allocations(), 0U);
}
