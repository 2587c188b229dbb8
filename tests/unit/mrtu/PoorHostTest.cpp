// The driver in a host that lacks what it could do without.
#include "framework/HostServicePointers.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::ScriptedPort;

class PoorHostTest : public ::testing::Test {
  protected:
    testing_support::FakeHost host;
};

TEST_F(PoorHostTest, WorksWithoutStorage) {
    host.withhold("IPermanentStorage");
    const driver_test::BoundModule module(host);
    ASSERT_EQ(nullptr, piPermanentStorage);
    ScriptedPort port(host.multiTask);
    host.serialFactory.offer("com1", port);
    Protocol_MRTU driver;
    ASSERT_NE(0, driver.Config(driver_test::configText("repeat=0").c_str()));
    ASSERT_NE(0, driver.Start());
    char answer[100] = {};
    EXPECT_EQ(1, driver.DoCommand("setid 1 9", answer, sizeof answer));
    port.silence();
    const auto* word = static_cast<const Tag_MRTU*>(driver.CreateTag("1?HREG?400001?short"));
    unsigned char data[2];
    EXPECT_FALSE(driver.doReadBlock(word, 0, data, 1));
    EXPECT_EQ(9, port.sent().at(0).at(0));
}

TEST_F(PoorHostTest, RestoresFromAStorageWithoutCopyingReads) {
    host.offerPlainStorage();
    const driver_test::BoundModule module(host);
    host.stored.put("MRTU", "tempNode1", std::string("9"));
    host.stored.put("MRTU", "zz", std::string("3"));
    ScriptedPort port(host.multiTask);
    host.serialFactory.offer("com1", port);
    Protocol_MRTU driver;
    ASSERT_NE(0, driver.Config(driver_test::configText().c_str()));
    ASSERT_NE(0, driver.Start());
    char answer[100] = {};
    EXPECT_EQ(1, driver.DoCommand("getid", answer, sizeof answer));
    EXPECT_STREQ("id 1 -> 9\n", answer);
    EXPECT_EQ(2, host.plainStorage.count("keyName"));
    EXPECT_EQ(1, host.plainStorage.count("readString"));
}

}  // namespace
