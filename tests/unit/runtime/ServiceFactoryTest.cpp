#include "runtime/ServiceFactory.h"

#include <gtest/gtest.h>

#include <thread>

#include "runtime/MemoryStorage.h"
#include "tests/unit/runtime/FakePluginHost.h"

namespace {

using namespace runtime;

TEST(ServiceFactoryTest, ServesTheRequiredFourByExactName) {
    FakeHost host;
    for (const char* name : {"IMultiTask2", "ISerialFactory", "ISocketFactory", "ICDSBuffer"}) {
        IInterface* service = host.services.CreateInterface(name);
        ASSERT_NE(service, nullptr) << name;
        EXPECT_NE(service->ConvertTo(name), nullptr) << name;
        EXPECT_EQ(nullptr, service->ConvertTo("IElse")) << name;
        EXPECT_EQ(1, host.services.outstanding(name)) << name;
    }
    EXPECT_EQ(4, host.services.outstanding());
}

TEST(ServiceFactoryTest, OthersAreNull) {
    FakeHost host;
    for (const char* name : {"IDiag", "IDriverInterface", "ISmux", "IFastTimer", "imultitask2",
                             "IMultiTask2 ", "", "IPermanentStorage"}) {
        EXPECT_EQ(nullptr, host.services.CreateInterface(name)) << name;
    }
    EXPECT_EQ(nullptr, host.services.CreateInterface(nullptr));
    EXPECT_EQ(0, host.services.outstanding());
}

TEST(ServiceFactoryTest, ServesStorageWhenThereIsOne) {
    PosixMultiTask multiTask;
    PosixSerialFactory serial;
    MemoryStorage storage;
    ServiceFactory services(multiTask, serial, &storage);
    IInterface* held = services.CreateInterface("IPermanentStorage");
    ASSERT_NE(held, nullptr);
    EXPECT_EQ(static_cast<IPermanentStorage2*>(&storage), held->ConvertTo("IPermanentStorage2"));
}

TEST(ServiceFactoryTest, CountsWhatIsHeld) {
    FakeHost host;
    IInterface* first = host.services.CreateInterface("IMultiTask2");
    IInterface* second = host.services.CreateInterface("IMultiTask2");
    EXPECT_EQ(2, host.services.outstanding());
    host.services.ReleaseInterface(first);
    host.services.ReleaseInterface(second);
    EXPECT_EQ(0, host.services.outstanding());
    EXPECT_EQ(0, host.services.strayReleases());
}

TEST(ServiceFactoryTest, NoticesReleasesOfWhatIsNotHeld) {
    FakeHost host;
    MemoryStorage foreign;
    host.services.ReleaseInterface(&foreign);
    host.services.ReleaseInterface(&host.multiTask);
    host.services.ReleaseInterface(nullptr);
    EXPECT_EQ(3, host.services.strayReleases());
    EXPECT_EQ(0, host.services.outstanding());
}

TEST(ServiceFactoryTest, CountsFromSeveralThreads) {
    FakeHost host;
    const auto takeAndGiveBack = [&host] {
        for (int round = 0; round < 1000; ++round) {
            host.services.ReleaseInterface(host.services.CreateInterface("ICDSBuffer"));
        }
    };
    std::thread other(takeAndGiveBack);
    takeAndGiveBack();
    other.join();
    EXPECT_EQ(0, host.services.outstanding());
    EXPECT_EQ(0, host.services.strayReleases());
}

}  // namespace
