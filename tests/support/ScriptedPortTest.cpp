// The scripted port and its factory: that they answer and notice a caller who misbehaves.
#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include "tests/support/FakeMultiTask.h"
#include "tests/support/RecordingSerialFactory.h"
#include "tests/support/Replies.h"
#include "tests/support/ScriptedPort.h"

namespace {

using testing_support::FakeMultiTask;
using testing_support::hex;
using testing_support::RecordingSerialFactory;
using testing_support::ScriptedPort;

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

}  // namespace
