// Look-ups lie on the path of every request, so they leave the heap alone.
#include "framework/AddressReplacer.h"
#include "framework/ParameterReplacer.h"
#include "tests/support/AllocationCounter.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

using ReplacerAllocationTest = ReplacerTest;
using testing_support::AllocationCounter;

TEST_F(ReplacerAllocationTest, CachedParametersAreFoundWithoutTheHeap) {
    ParameterReplacer replacer;
    replacer.setSection("MRTU");
    int baud = 0;
    bool modicon = false;
    // Long enough that a std::string of the full name would have to allocate.
    constexpr std::string_view kName = "AParameterWithQuiteALongName";

    AllocationCounter first;
    replacer.get(kName, 247, true, modicon);
    replacer.get("baud", -1, 9600, baud);
    EXPECT_GT(first.allocations(), 0u) << "the counter does not count";

    AllocationCounter cached;
    for (int i = 0; i < 100; ++i) {
        replacer.get(kName, 247, true, modicon);
        replacer.get("baud", -1, 9600, baud);
    }
    EXPECT_EQ(0u, cached.allocations());
    EXPECT_TRUE(modicon);
    EXPECT_EQ(9600, baud);
}

TEST_F(ReplacerAllocationTest, ReplacedAddressesAreFoundWithoutTheHeap) {
    AddressReplacerID replacer;
    for (int node = 1; node < 248; ++node)
        replacer.setValue(node, node + 1, nullptr);
    AllocationCounter counter;
    for (int node = 1; node < 248; ++node)
        EXPECT_EQ(node + 1, replacer.replacementOf(node));
    EXPECT_EQ(0u, counter.allocations());
}

}  // namespace
