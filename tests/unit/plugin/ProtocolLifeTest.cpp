// A protocol object that is made and thrown away and never used.
#include "plugin/ProtFactory.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using testing_support::FakeHost;

TEST(ProtocolLifeTest, CreationAndDeletionCostNoServiceCalls) {
    FakeHost host;
    const driver_test::BoundModule module(host);
    host.forget();
    auto* factory = static_cast<IProtocolFactory*>(
        GetInterfaceFactory()->CreateInterface("IProtocolFactory")->ConvertTo("IProtocolFactory"));
    factory->DeleteProtocol(factory->CreateProtocol("MRTU"));
    EXPECT_TRUE(host.calls().empty());
    EXPECT_EQ(0, host.multiTask.locksAlive());
}

}  // namespace
