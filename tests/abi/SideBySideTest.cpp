// Two copies of the plug-in in one process: a host with two drivers of the family, or two releases
// of this one.
#include <gtest/gtest.h>

#include <string>

#include "tests/abi/LoadedPlugin.h"
#include "tests/support/FakeHost.h"

namespace {

using abi_test::command;
using testing_support::FakeHost;

struct Copy {
    abi_test::PluginCopy files;
    FakeHost host;
    abi_test::Plugin plugin{files.file()};

    void* servicePointer(const char* name) const {
        return *static_cast<void**>(plugin.symbol(name));
    }
};

class SideBySideTest : public ::testing::Test {
  protected:
    Copy first;
    Copy second;
};

TEST_F(SideBySideTest, EachHasItsOwnObjects) {
    EXPECT_NE(first.plugin.symbol("GetInterfaceFactory"),
              second.plugin.symbol("GetInterfaceFactory"));
    EXPECT_NE(&first.plugin.module(), &second.plugin.module());
    EXPECT_NE(&first.plugin.protocols(), &second.plugin.protocols());
}

TEST_F(SideBySideTest, EachCountsItsOwnInits) {
    ASSERT_EQ(1, first.plugin.module().Init(&first.host));
    ASSERT_EQ(1, first.plugin.module().Init(&first.host));
    EXPECT_EQ(0, second.host.held());
    ASSERT_EQ(1, second.plugin.module().Init(&second.host));
    second.plugin.module().Close();
    EXPECT_EQ(0, second.host.held());
    first.plugin.module().Close();
    EXPECT_EQ(9, first.host.held());
    first.plugin.module().Close();
    EXPECT_EQ(0, first.host.held());
}

TEST_F(SideBySideTest, EachHoldsItsOwnServices) {
    ASSERT_EQ(1, first.plugin.module().Init(&first.host));
    ASSERT_EQ(1, second.plugin.module().Init(&second.host));
    EXPECT_EQ(first.host.service("IMultiTask2"), first.servicePointer("piMultiTask"));
    EXPECT_EQ(second.host.service("IMultiTask2"), second.servicePointer("piMultiTask"));
    EXPECT_EQ(first.host.service("IFastTimer"), first.servicePointer("piFastTimer"));
    EXPECT_EQ(second.host.service("IFastTimer"), second.servicePointer("piFastTimer"));
    first.plugin.module().Close();
    EXPECT_EQ(nullptr, first.servicePointer("piMultiTask"));
    EXPECT_EQ(second.host.service("IMultiTask2"), second.servicePointer("piMultiTask"));
    second.plugin.module().Close();
}

TEST_F(SideBySideTest, OverridesAndLocksGoToTheOwnHost) {
    ASSERT_EQ(1, first.plugin.module().Init(&first.host));
    ASSERT_EQ(1, second.plugin.module().Init(&second.host));
    IProtocol* const one = first.plugin.protocols().CreateProtocol("MRTU");
    IProtocol* const two = second.plugin.protocols().CreateProtocol("MRTU");
    EXPECT_EQ(1, first.host.multiTask.locksAlive());
    EXPECT_EQ(1, second.host.multiTask.locksAlive());

    EXPECT_EQ("id 5 set to 9\n", command(*one, "setid 5 9"));
    EXPECT_EQ("text:9", first.host.stored.describe("MRTU", "tempNode5"));
    EXPECT_EQ("none", second.host.stored.describe("MRTU", "tempNode5"));
    EXPECT_EQ("id 5 -> 9\n", command(*one, "getid"));
    EXPECT_EQ("id 6 set to 7\n", command(*two, "setid 6 7"));
    EXPECT_EQ("id 6 -> 7\n", command(*two, "getid"));
    EXPECT_EQ("none", first.host.stored.describe("MRTU", "tempNode6"));

    first.plugin.protocols().DeleteProtocol(one);
    EXPECT_EQ(0, first.host.multiTask.locksAlive());
    EXPECT_EQ(1, second.host.multiTask.locksAlive());
    second.plugin.protocols().DeleteProtocol(two);
    first.plugin.module().Close();
    second.plugin.module().Close();
}

}  // namespace
