// The doubles themselves: that they notice a caller who misbehaves.
#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include "tests/support/FakeHost.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::FakeHost;
using testing_support::FakeMultiTask;
using testing_support::hex;
using testing_support::RecordingSerialFactory;
using testing_support::ScriptedPort;
using testing_support::toHex;

TEST(FakeMultiTaskTest, SleepMovesTheClock) {
    FakeMultiTask tasks;
    tasks.sleep(250);
    tasks.advance(50);
    EXPECT_EQ(300, tasks.nowMs());
    ASSERT_EQ(1U, tasks.sleeps().size());
    EXPECT_FALSE(tasks.sleeps()[0].lockHeld);
}

TEST(FakeMultiTaskTest, LocksAreWatched) {
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

TEST(FakeMultiTaskTest, ForgottenLockIsNoticed) {
    EXPECT_NONFATAL_FAILURE(
        {
            FakeMultiTask tasks;
            tasks.createLock(0);
        },
        "never deleted");
}

class ScriptedPortTest : public ::testing::Test {
  protected:
    ScriptedPortTest() { lock->lock(); }
    ~ScriptedPortTest() override {
        lock->unlock();
        tasks.deleteLock(lock);
    }

    FakeMultiTask tasks;
    ILock* lock = tasks.createLock(0);
    ScriptedPort port{tasks};
    unsigned char byte = 0;
};

TEST_F(ScriptedPortTest, AnswersFromItsList) {
    port.reply(hex("01 02 03"));
    port.silence();
    const unsigned char request[] = {0x11};
    unsigned char rest[8] = {};
    int received = -1;
    EXPECT_NE(0, port.send(request, 1));
    EXPECT_NE(0, port.receiveByte(&byte, 100, 0));
    EXPECT_EQ(0x01, byte);
    EXPECT_NE(0, port.receiveFrame(rest, 8, 100, 5, &received, 0));
    EXPECT_EQ(2, received);
    EXPECT_EQ(0, tasks.nowMs());
    EXPECT_NE(0, port.send(request, 1));
    EXPECT_EQ(0, port.receiveByte(&byte, 100, 0));
    EXPECT_EQ(100, tasks.nowMs());
    EXPECT_EQ(0U, port.scriptLeft());
}

TEST_F(ScriptedPortTest, RequestWithoutAnEntryIsNoticed) {
    const unsigned char request[] = {0x11};
    EXPECT_NONFATAL_FAILURE(port.send(request, 1), "no reply is scripted for the request 11");
}

TEST_F(ScriptedPortTest, EmptyRequestIsNoticed) {
    EXPECT_NONFATAL_FAILURE(port.send(&byte, 0), "send() of 0 bytes");
}

TEST_F(ScriptedPortTest, MissingLockIsNoticed) {
    lock->unlock();
    EXPECT_NONFATAL_FAILURE(port.receiveByte(&byte, 0, 0), "without the transaction lock");
    lock->lock();
}

TEST_F(ScriptedPortTest, UseAfterReleaseIsNoticed) {
    port.markReleased();
    EXPECT_NONFATAL_FAILURE(port.receiveByte(&byte, 0, 0), "of a released port");
    EXPECT_NONFATAL_FAILURE(port.configure(1, 2, 3, 4, 5), "of a released port");
}

TEST_F(ScriptedPortTest, LeftOverEntriesAreNoticed) {
    EXPECT_NONFATAL_FAILURE(
        {
            ScriptedPort forgotten(tasks);
            forgotten.silence();
        },
        "were not asked for");
}

TEST_F(ScriptedPortTest, FactoryNoticesForeignAndDoubleReleases) {
    RecordingSerialFactory factory;
    factory.offer("com1", port);
    EXPECT_NONFATAL_FAILURE(factory.releasePort(&port), "not open");
    EXPECT_EQ(nullptr, factory.openPort("com2"));
    EXPECT_EQ(&port, factory.openPort("com1"));
    factory.releasePort(&port);
    EXPECT_NONFATAL_FAILURE(factory.releasePort(&port), "not open");
}

TEST_F(ScriptedPortTest, FactoryNoticesAPortLeftOpen) {
    EXPECT_NONFATAL_FAILURE(
        {
            RecordingSerialFactory factory;
            factory.offer("com1", port);
            factory.openPort("com1");
        },
        "never released");
}

TEST(FakeHostTest, ReleasesAreWatched) {
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

TEST(FakeStorageTest, KeepsValuesByTypeAndRefusesWhenTold) {
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

TEST(RepliesTest, ChecksAgreeWithPublishedFrames) {
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
