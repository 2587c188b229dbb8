#include <gmock/gmock.h>

#include <optional>

#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "tests/unit/runtime/FakePluginHost.h"

namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;
using namespace runtime;

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

class PluginRefusalTest : public ::testing::TestWithParam<RefusalRow> {};

TEST_P(PluginRefusalTest, NamesItsReasonAndReleasesTheLibrary) {
    const std::string path = fakePlugin(GetParam().file);
    const auto error = refusalOf(path, GetParam().protocol);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(GetParam().fault, error->fault);
    EXPECT_THAT(error->text, StartsWith(path + ": "));
    EXPECT_THAT(error->text, HasSubstr(GetParam().text));
    EXPECT_FALSE(isLoaded(path));
}

INSTANTIATE_TEST_SUITE_P(
    OfEachKind, PluginRefusalTest,
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

}  // namespace
