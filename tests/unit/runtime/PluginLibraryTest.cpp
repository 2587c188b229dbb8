#include "runtime/PluginLibrary.h"

#include <dlfcn.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <optional>

#include "runtime/Module.h"
#include "tests/unit/runtime/FakeHost.h"

namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;
using namespace runtime;

bool isLoaded(const std::string& path) {
    void* handle = ::dlopen(path.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle == nullptr) return false;
    ::dlclose(handle);
    return true;
}

/// The whole way to a protocol object; the first refusal is the answer.
std::optional<PluginError> refusalOf(const std::string& path, const std::string& protocol) {
    FakeHost host;
    const auto library = PluginLibrary::load(path);
    if (!library) return library.error();
    const auto module = Module::bind(library.value(), host.services);
    if (!module) return module.error();
    const auto made = module.value().createProtocol(protocol);
    if (!made) return made.error();
    return std::nullopt;
}

struct RefusalRow {
    const char* name;
    const char* file;
    const char* protocol;
    PluginFault fault;
    const char* text;
};

class Refusal : public ::testing::TestWithParam<RefusalRow> {};

TEST_P(Refusal, NamesItsReasonAndReleasesTheLibrary) {
    const std::string path = fakePlugin(GetParam().file);
    const auto error = refusalOf(path, GetParam().protocol);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(GetParam().fault, error->fault);
    EXPECT_THAT(error->text, StartsWith(path + ": "));
    EXPECT_THAT(error->text, HasSubstr(GetParam().text));
    EXPECT_FALSE(isLoaded(path));
}

INSTANTIATE_TEST_SUITE_P(
    OfEachKind, Refusal,
    ::testing::Values(
        RefusalRow{"NoSuchFile", "nowhere.so", "FAKE", PluginFault::NoSuchFile,
                   "No such file or directory"},
        RefusalRow{"EmptyLibrary", "empty_library.so", "FAKE", PluginFault::NotADriver,
                   "not a driver: it has no GetInterfaceFactory"},
        RefusalRow{"NoFactory", "no_factory_plugin.so", "FAKE", PluginFault::NotADriver,
                   "not a driver: its GetInterfaceFactory gives no factory"},
        RefusalRow{"NoModule", "no_module_plugin.so", "FAKE", PluginFault::NoModule,
                   "the driver has no IProtModule"},
        RefusalRow{"NoProtocolFactory", "no_protocol_factory_plugin.so", "FAKE",
                   PluginFault::NoFactory, "the driver has no IProtocolFactory"},
        RefusalRow{"InitFails", "init_fails_plugin.so", "FAKE", PluginFault::InitFailed,
                   "Init failed: the moon is not full"},
        RefusalRow{"UnknownProtocol", "works_plugin.so", "fake", PluginFault::UnknownProtocol,
                   "unknown protocol 'fake'"},
        RefusalRow{"ProtocolThrows", "works_plugin.so", "THROWS", PluginFault::ProtocolNotMade,
                   "protocol 'THROWS' could not be made"}),
    [](const auto& row) { return row.param.name; });

TEST(PluginLibrary, TextFileIsNotALibrary) {
    const std::string path = ::testing::TempDir() + "text" + std::to_string(::getpid()) + ".so";
    std::ofstream(path) << "I am a text.\n";
    const auto library = PluginLibrary::load(path);
    std::remove(path.c_str());
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NotALibrary, library.error().fault);
    EXPECT_THAT(library.error().text, StartsWith(path + ": not a loadable library: "));
}

TEST(PluginLibrary, DirectoryIsNotALibrary) {
    const auto library = PluginLibrary::load(FAKE_PLUGINS);
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NotALibrary, library.error().fault);
}

TEST(PluginLibrary, BareNameIsNotSearchedInTheSystem) {
    const auto library = PluginLibrary::load("libc.so.6");
    ASSERT_FALSE(library);
    EXPECT_EQ(PluginFault::NoSuchFile, library.error().fault);
}

TEST(PluginLibrary, StaysLoadedUntilTheLastUserIsGone) {
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

TEST(Module, FailedInitIsNotClosed) {
    // Its Close() would hand back what it never took.
    FakeHost host;
    const auto library = PluginLibrary::load(fakePlugin("init_fails_plugin.so"));
    ASSERT_TRUE(library);
    EXPECT_FALSE(Module::bind(library.value(), host.services));
    EXPECT_EQ(0, host.services.strayReleases());
}

TEST(Module, TellsWhichGenerationsAProtocolObjectHas) {
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
