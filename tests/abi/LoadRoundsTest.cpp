// Loading and unloading, over and over.
#include <gtest/gtest.h>

#include <iostream>

#include "tests/abi/LoadedPlugin.h"
#include "tests/abi/Process.h"
#include "tests/support/FakeHost.h"

namespace {

constexpr const char* kConfig =
    "CfgVer=1 defNodeId=1 model=3 uart=com1 baudrate=19200 parity=even stopbits=1 mode=RS-485 "
    "txMode=RTU timeout=500";
constexpr int kRounds = 10'000;
/// Until here the allocator and the loader fill their own stores.
constexpr int kWarmUp = 200;
/// One page leaked each tenth round would be sixteen times this.
constexpr std::size_t kSlackKiB = 256;
/// One byte leaked each round would be twice this.
constexpr std::size_t kSlackBytes = 4096;

struct Holdings {
    std::size_t files = abi_test::openFiles();
    std::size_t mappings = abi_test::mappings();
    std::size_t mappedKiB = abi_test::mappedKiB();
    std::size_t heapBytes = abi_test::heapBytes();
    std::size_t residentKiB = abi_test::residentKiB();
};

void expectSameMemory([[maybe_unused]] const Holdings& before,
                      [[maybe_unused]] const Holdings& after) {
#ifndef MRTU_SANITIZED  // A sanitizer keeps what was freed; leaks are its own business.
    EXPECT_LE(after.mappings, before.mappings);
    EXPECT_LE(after.mappedKiB, before.mappedKiB + kSlackKiB);
    EXPECT_LE(after.heapBytes, before.heapBytes + kSlackBytes);
#ifndef MRTU_EMULATED  // The emulator's translations of every library count as resident here.
    EXPECT_LE(after.residentKiB, before.residentKiB + kSlackKiB);
#endif
#endif
}

/// One life of a plug-in in a host.
bool round() {
    testing_support::FakeHost host;
    const abi_test::Plugin plugin(PLUGIN_PATH);
    if (plugin.module().Init(&host) != 1) return false;
    IProtocol* const protocol = plugin.protocols().CreateProtocol("MRTU");
    const bool made = protocol != nullptr && protocol->Config(kConfig) != 0;
    plugin.protocols().DeleteProtocol(protocol);
    plugin.module().Close();
    return made && host.held() == 0;
}

TEST(LoadRoundsTest, TenThousandRoundsLeaveNothingBehind) {
    for (int i = 0; i < kWarmUp; ++i)
        ASSERT_TRUE(round()) << i;
    const Holdings before;
    for (int i = kWarmUp; i < kRounds; ++i)
        ASSERT_TRUE(round()) << i;
    const Holdings after;

    EXPECT_EQ(before.files, after.files);
    expectSameMemory(before, after);
    // For whoever compares builds.
    std::cout << "resident " << before.residentKiB << " -> " << after.residentKiB << " KiB, heap "
              << before.heapBytes << " -> " << after.heapBytes << " bytes, mapped "
              << before.mappedKiB << " -> " << after.mappedKiB << " KiB\n";
    EXPECT_EQ(0U, abi_test::mappings("libmrtu.so"));
    EXPECT_EQ(0U, abi_test::mappings("libprotgen.so"));
    EXPECT_FALSE(abi_test::Plugin::isLoaded(PLUGIN_PATH));
    EXPECT_FALSE(abi_test::Plugin::isLoaded(ENGINE_PATH));
}

TEST(LoadRoundsTest, StaysAsLongAsSomebodyHoldsIt) {
    {
        const abi_test::Plugin first(PLUGIN_PATH);
        { const abi_test::Plugin second(PLUGIN_PATH); }
        EXPECT_TRUE(abi_test::Plugin::isLoaded(PLUGIN_PATH));
        EXPECT_TRUE(abi_test::Plugin::isLoaded(ENGINE_PATH));
    }
    EXPECT_FALSE(abi_test::Plugin::isLoaded(PLUGIN_PATH));
    EXPECT_FALSE(abi_test::Plugin::isLoaded(ENGINE_PATH));
}

TEST(LoadRoundsTest, UnloadingTakesBackWhatTheHostForgot) {
    testing_support::FakeHost host;
    {
        const abi_test::Plugin plugin(PLUGIN_PATH);
        ASSERT_EQ(1, plugin.module().Init(&host));
        EXPECT_EQ(9, host.held());
    }
    EXPECT_EQ(0, host.held());
}

TEST(LoadRoundsTest, StartsNoThread) {
    const std::size_t before = abi_test::threads();
    testing_support::FakeHost host;
    testing_support::ScriptedPort port{host.multiTask};
    host.serialFactory.offer("com1", port);
    const abi_test::Plugin plugin(PLUGIN_PATH);
    ASSERT_EQ(1, plugin.module().Init(&host));
    IProtocol* const protocol = plugin.protocols().CreateProtocol("MRTU");
    ASSERT_NE(nullptr, protocol);
    EXPECT_NE(0, protocol->Config(kConfig));
    EXPECT_NE(0, protocol->Start()) << protocol->GetLastErrorString();
    EXPECT_EQ(before, abi_test::threads());
    plugin.protocols().DeleteProtocol(protocol);
    plugin.module().Close();
    EXPECT_EQ(before, abi_test::threads());
}

}  // namespace
