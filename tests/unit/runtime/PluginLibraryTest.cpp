#include "runtime/PluginLibrary.h"

#include <gmock/gmock.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <optional>

#include "runtime/Module.h"
#include "tests/unit/runtime/FakePluginHost.h"

namespace {

using ::testing::StartsWith;
using namespace runtime;

TEST(PluginLibraryTest, TextFileIsNotALibrary) {
    const std::string path = ::testing::TempDir() + "text" + std::to_string(::getpid()) + ".so";
    std::ofstream(path) << "I am a text.\n";
    const auto library = PluginLibrary::load(path);
    std::remove(path.c_str());
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NotALibrary, library.error().fault);
    EXPECT_THAT(library.error().text, StartsWith(path + ": not a loadable library: "));
}

TEST(PluginLibraryTest, DirectoryIsNotALibrary) {
    const auto library = PluginLibrary::load(FAKE_PLUGINS);
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NotALibrary, library.error().fault);
}

TEST(PluginLibraryTest, BareNameIsNotSearchedInTheSystem) {
    const auto library = PluginLibrary::load("libc.so.6");
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NoSuchFile, library.error().fault);
}

TEST(PluginLibraryTest, StaysLoadedUntilTheLastUserIsGone) {
    const std::string path = fakePlugin("works_plugin.so");
    FakeHost host;
    std::optional<ProtocolObject> protocol;
    {
        const auto library = PluginLibrary::load(path);
        ASSERT_TRUE(library);
        const auto module = Module::bind(library.value(), host.services);
        ASSERT_TRUE(module);
        auto made = module.value().createProtocol("FAKE");
        ASSERT_TRUE(made);
        protocol = std::move(made).value();
    }
    EXPECT_TRUE(isLoaded(path));
    EXPECT_EQ(1, host.services.outstanding());
    EXPECT_STREQ("FAKE", (*protocol)->GetName());
    protocol.reset();
    EXPECT_FALSE(isLoaded(path));
    EXPECT_EQ(0, host.services.outstanding());
    EXPECT_EQ(0, host.services.strayReleases());
}

TEST(PluginLibraryTest, ModuleFailedInitIsNotClosed) {
    // Its Close() would hand back what it never took.
    FakeHost host;
    const auto library = PluginLibrary::load(fakePlugin("init_fails_plugin.so"));
    ASSERT_TRUE(library);
    EXPECT_FALSE(Module::bind(library.value(), host.services));
    EXPECT_EQ(0, host.services.strayReleases());
}

TEST(PluginLibraryTest, ModuleTellsWhichGenerationsAProtocolObjectHas) {
    FakeHost host;
    const auto library = PluginLibrary::load(fakePlugin("works_plugin.so"));
    ASSERT_TRUE(library);
    const auto module = Module::bind(library.value(), host.services);
    ASSERT_TRUE(module);
    const auto made = module.value().createProtocol("FAKE");
    ASSERT_TRUE(made);
    EXPECT_EQ(made.value().get(), made.value().as<IProtocol2>("IProtocol2"));
    EXPECT_EQ(nullptr, made.value().as<IProtocol7>("IProtocol7"));
}

}  // namespace
