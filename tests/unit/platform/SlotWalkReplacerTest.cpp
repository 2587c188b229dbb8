// The library's own address replacer, called through its table.
#include <gtest/gtest.h>

#include <string>

#include "tests/unit/mrtu/DriverTest.h"
#include "tests/unit/platform/ProtocolOperations.h"

namespace {

using slots::call;

TEST(SlotWalkReplacerTest, AddressReplacerHasThreeOperationsAndNoDestructor) {
    AddressReplacerID replacer;
    EXPECT_EQ("tempNode", call<std::string>(&replacer, 0));
    EXPECT_EQ("-12", call<std::string>(&replacer, 1, -12));
    const std::string text = "0x1F";
    EXPECT_EQ(31, call<int>(&replacer, 2, &text));
}

}  // namespace
