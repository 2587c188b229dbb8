// The doubles themselves: that they notice a caller who misbehaves.
#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include "tests/support/FakeHost.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::FakeHost;
using testing_support::FakeMultiTask;
using testing_support::toHex;

TEST(PoliceTest, MultiTaskSleepMovesTheClock) {
    FakeMultiTask tasks;
    tasks.sleep(250);
    tasks.advance(50);
    EXPECT_EQ(300, tasks.nowMs());
    ASSERT_EQ(1U, tasks.sleeps().size());
    EXPECT_FALSE(tasks.sleeps()[0].lockHeld);
}

TEST(PoliceTest, MultiTaskLocksAreWatched) {
    FakeMultiTask tasks;
    ILock* lock = tasks.createLock(0);
    EXPECT_NONFATAL_FAILURE(lock->unlock(), "does not hold it");
    lock->lock();
    EXPECT_TRUE(tasks.heldByThisThread());
    EXPECT_NONFATAL_FAILURE(lock->lock(), "holds already");
    lock->unlock();
    EXPECT_FALSE(tasks.anyLockHeld());
    tasks.deleteLock(lock);
    EXPECT_NONFATAL_FAILURE(tasks.deleteLock(lock), "does not exist");
}

TEST(PoliceTest, MultiTaskForgottenLockIsNoticed) {
    EXPECT_NONFATAL_FAILURE(
        {
            FakeMultiTask tasks;
            tasks.createLock(0);
        },
        "never deleted");
}

TEST(PoliceTest, HostReleasesAreWatched) {
    FakeHost host;
    IInterface* tasks = host.CreateInterface("IMultiTask2");
    EXPECT_EQ(1, host.held());
    host.ReleaseInterface(tasks);
    EXPECT_NONFATAL_FAILURE(host.ReleaseInterface(tasks), "once too often");
    EXPECT_NONFATAL_FAILURE(host.ReleaseInterface(nullptr), "none of this host");
    EXPECT_EQ(nullptr, host.CreateInterface("INothing"));
    EXPECT_EQ(1, host.created("IMultiTask2"));
    EXPECT_EQ(2, host.released("IMultiTask2"));
}

TEST(PoliceTest, StorageKeepsValuesByTypeAndRefusesWhenTold) {
    FakeHost host;
    auto* storage = static_cast<IPermanentStorage2*>(
        host.CreateInterface("IPermanentStorage")->ConvertTo("IPermanentStorage2"));
    storage->writeInt("a", "n", 7);
    storage->writeString("a", "t", "text");
    storage->writeBool("b", "f", true);
    EXPECT_EQ(7, storage->readInt("a", "n"));
    EXPECT_STREQ("text", storage->readString("a", "t"));
    EXPECT_TRUE(storage->readBool("b", "f"));
    EXPECT_EQ(2, storage->keyCount("a"));
    EXPECT_STREQ("t", storage->keyName("a", 1));
    char small[4];
    char large[5];
    EXPECT_EQ(0, storage->readStringInto("a", "t", small, sizeof small));
    EXPECT_NE(0, storage->readStringInto("a", "t", large, sizeof large));
    EXPECT_STREQ("text", large);
    host.storage.refuseWrites();
    storage->removeKey("a", "n");
    EXPECT_NE(0, storage->hasKey("a", "n"));
    EXPECT_EQ(nullptr, host.plainStorage.ConvertTo("IPermanentStorage2"));
}

TEST(PoliceTest, RepliesChecksAgreeWithPublishedFrames) {
    EXPECT_EQ("01 03 00 00 00 0A C5 CD",
              toHex(testing_support::rtuFrame(testing_support::request(1, 3, 0, 10))));
    EXPECT_EQ("37 4B", toHex(testing_support::crcOf(testing_support::characters("123456789"))));
    EXPECT_EQ(testing_support::characters(":01030000000AF2\r\n"),
              testing_support::asciiFrame(testing_support::request(1, 3, 0, 10)));
    EXPECT_EQ("01 01 02 CD 01",
              toHex(testing_support::bitsReply(
                  1, 1, {true, false, true, true, false, false, true, true, true})));
}

}  // namespace
