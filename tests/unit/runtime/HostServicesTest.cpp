#include "runtime/HostServices.h"

#include <gtest/gtest.h>

#include <thread>

#include "runtime/MemoryStorage.h"
#include "tests/unit/runtime/FakeHost.h"

namespace {

using namespace runtime;

TEST(HostServices, ServesTheRequiredFourByExactName) {
    FakeHost host;
    for (const char* name : {"IMultiTask2", "ISerialFactory", "ISocketFactory", "ICDSBuffer"}) {
        IInterface* service = host.services.CreateInterface(name);
        ASSERT_NE(service, nullptr) << name;
        EXPECT_NE(service->ConvertTo(name), nullptr) << name;
        EXPECT_EQ(service->ConvertTo("IElse"), nullptr) << name;
        EXPECT_EQ(host.services.outstanding(name), 1) << name;
    }
    EXPECT_EQ(host.services.outstanding(), 4);
}

TEST(HostServices, OthersAreNull) {
    FakeHost host;
    for (const char* name : {"IDiag", "IDriverInterface", "ISmux", "IFastTimer", "imultitask2",
                             "IMultiTask2 ", "", "IPermanentStorage"}) {
        EXPECT_EQ(host.services.CreateInterface(name), nullptr) << name;
    }
    EXPECT_EQ(host.services.CreateInterface(nullptr), nullptr);
    EXPECT_EQ(host.services.outstanding(), 0);
}

TEST(HostServices, ServesStorageWhenThereIsOne) {
    PosixMultiTask multiTask;
    PosixSerialFactory serial;
    MemoryStorage storage;
    HostServices services(multiTask, serial, &storage);
    IInterface* held = services.CreateInterface("IPermanentStorage");
    ASSERT_NE(held, nullptr);
    EXPECT_EQ(held->ConvertTo("IPermanentStorage2"), static_cast<IPermanentStorage2*>(&storage));
}

TEST(HostServices, CountsWhatIsHeld) {
    FakeHost host;
    IInterface* first = host.services.CreateInterface("IMultiTask2");
    IInterface* second = host.services.CreateInterface("IMultiTask2");
    EXPECT_EQ(host.services.outstanding(), 2);
    host.services.ReleaseInterface(first);
    host.services.ReleaseInterface(second);
    EXPECT_EQ(host.services.outstanding(), 0);
    EXPECT_EQ(host.services.strayReleases(), 0);
}

TEST(HostServices, NoticesReleasesOfWhatIsNotHeld) {
    FakeHost host;
    MemoryStorage foreign;
    host.services.ReleaseInterface(&foreign);
    host.services.ReleaseInterface(&host.multiTask);
    host.services.ReleaseInterface(nullptr);
    EXPECT_EQ(host.services.strayReleases(), 3);
    EXPECT_EQ(host.services.outstanding(), 0);
}

TEST(HostServices, CountsFromSeveralThreads) {
    FakeHost host;
    const auto takeAndGiveBack = [&host] {
        for (int round = 0; round < 1000; ++round) {
            host.services.ReleaseInterface(host.services.CreateInterface("ICDSBuffer"));
        }
    };
    std::thread other(takeAndGiveBack);
    takeAndGiveBack();
    other.join();
    EXPECT_EQ(host.services.outstanding(), 0);
    EXPECT_EQ(host.services.strayReleases(), 0);
}

}  // namespace
