// One of two copies of the plug-in leaves the process before the other.
#include <gtest/gtest.h>

#include <memory>

#include "tests/abi/LoadedPlugin.h"
#include "tests/support/FakeHost.h"

namespace {

using abi_test::command;
using testing_support::FakeHost;

TEST(UnloadOrderTest, TheSecondGoesOnWhenTheFirstIsUnloaded) {
    FakeHost host;
    const abi_test::PluginCopy secondFiles;
    {
        const abi_test::PluginCopy firstFiles;
        auto first = std::make_unique<abi_test::Plugin>(firstFiles.file());
        FakeHost firstHost;
        const abi_test::Plugin second(secondFiles.file());
        ASSERT_EQ(1, first->module().Init(&firstHost));
        ASSERT_EQ(1, second.module().Init(&host));
        IProtocol* const protocol = second.protocols().CreateProtocol("MRTU");
        first->module().Close();
        first.reset();
        EXPECT_EQ("id 5 set to 9\n", command(*protocol, "setid 5 9"));
        EXPECT_EQ("text:9", host.stored.describe("MRTU", "tempNode5"));
        EXPECT_EQ(9, host.held());
        second.protocols().DeleteProtocol(protocol);
        second.module().Close();
        EXPECT_EQ(0, host.held());
    }
    EXPECT_FALSE(abi_test::Plugin::isLoaded(secondFiles.file()));
}

}  // namespace
