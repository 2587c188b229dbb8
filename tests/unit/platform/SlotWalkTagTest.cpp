// The library's own tags, called through their table.
#include <gtest/gtest.h>

#include "tests/unit/mrtu/DriverTest.h"
#include "tests/unit/platform/ProtocolOperations.h"

namespace {

using slots::call;
using Text = const char*;

class SlotWalkTagTest : public driver_test::DriverTest {
  protected:
    template <class Result, class... Arguments>
    static Result run(const ITag* tag, std::size_t behindDestructor, Arguments... arguments) {
        return call<Result, Arguments...>(const_cast<ITag*>(tag),
                                          slots::kDestructors + behindDestructor, arguments...);
    }
};

TEST_F(SlotWalkTagTest, EveryOperation) {
    configure();
    const ITag* one = tag("1?HREG?400010?short-2(swap2)");
    auto* copy = run<ITag*>(one, 0);
    ASSERT_NE(nullptr, copy);
    EXPECT_STREQ(one->GetVarName(), copy->GetVarName());
    call<void>(copy, 1);
    EXPECT_EQ(9U, run<unsigned>(one, 1));
    EXPECT_EQ(0, run<int>(one, 2));
    EXPECT_STREQ("1?HREG?400010?short-2(swap2)", run<Text>(one, 3));
    EXPECT_EQ(ICU_Type::shortArray, run<ICU_Type>(one, 4));
    EXPECT_EQ(4, run<int>(one, 5));
    EXPECT_EQ(ICU_Type::short_, run<ICU_Type>(one, 6));
    EXPECT_EQ(4, run<int>(one, 7));
    const unsigned char* from = reinterpret_cast<const unsigned char*>("abcd");
    unsigned char to[5] = {};
    EXPECT_TRUE(run<bool>(one, 8, from, static_cast<unsigned char*>(to), false));
    EXPECT_STREQ("badc", reinterpret_cast<Text>(to));
    EXPECT_FALSE(run<bool>(one, 9));
    EXPECT_FALSE(run<bool>(one, 10));
    EXPECT_TRUE(run<bool>(one, 11, from, static_cast<unsigned char*>(to), true));
    EXPECT_STREQ("badc", reinterpret_cast<Text>(to));
    EXPECT_TRUE(run<bool>(one, 12, static_cast<unsigned char*>(to), Text("swap4"), false));
    EXPECT_STREQ("cdab", reinterpret_cast<Text>(to));
}

TEST_F(SlotWalkTagTest, ReadOnlyAreaIsToldThroughItsEntry) {
    configure();
    EXPECT_TRUE(run<bool>(tag("1?IREG?300001?short"), 9));
}

}  // namespace
