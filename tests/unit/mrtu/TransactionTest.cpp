// One exchange over the line: pause, lock, attempts, time-outs, retries.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::ScriptedPort;
using driver_test::toHex;
using testing_support::operator+;

const char* const kUri = "1?HREG?400001?unsignedShort";
const Bytes kGood = rtuFrame(hex("01 03 02 12 34"));
const std::string kRequest = "01 03 00 00 00 01 84 0A";

class TransactionTest : public DriverTest {
  protected:
    bool readOne() { return read(tag(kUri), 1); }
};

TEST_F(TransactionTest, GoldenExchange) {
    start();
    port.reply(kGood);
    ASSERT_TRUE(readOne()) << driver->GetLastErrorString();
    EXPECT_EQ(kRequest, sent());
    EXPECT_EQ("34 12", toHex(got(2)));
}

TEST_F(TransactionTest, GoldenRequestForTenRegisters) {
    start();
    port.reply(rtuFrame(hex("01 03 14") + Bytes(20, 7)));
    ASSERT_TRUE(read(tag(kUri), 10));
    EXPECT_EQ("01 03 00 00 00 0A C5 CD", sent());
}

TEST_F(TransactionTest, WaitsWithTimeoutAndGapOfTheConfiguration) {
    start("timeout=350");
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(std::vector<int>{350}, port.byteWaits());
    EXPECT_EQ((std::vector<ScriptedPort::FrameWait>{{512, 350, 13}}), port.frameWaits());
}

TEST_F(TransactionTest, TimeoutIsTheNodesOwn) {
    start("timeout=350 Node2::timeout=90");
    port.reply(rtuFrame(hex("02 03 02 12 34")));
    ASSERT_TRUE(read(tag("2?HREG?400001?unsignedShort"), 1));
    EXPECT_EQ(std::vector<int>{90}, port.byteWaits());
    EXPECT_EQ("02 03 00 00 00 01 84 39", sent());
}

TEST_F(TransactionTest, NothingHappensBeforeStart) {
    configure("delay=10");
    const Tag_MRTU* word = tag(kUri);
    const int locked = host.multiTask.timesLocked();
    EXPECT_FALSE(read(word, 1));
    expectError(-3, "Protocol not started");
    plantError();
    EXPECT_EQ(0, write(word, hex("34 12"), 1));
    expectError(-3, "Protocol not started");
    EXPECT_EQ(locked, host.multiTask.timesLocked());
    EXPECT_TRUE(host.multiTask.sleeps().empty());
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(TransactionTest, NothingHappensAfterStop) {
    start();
    const Tag_MRTU* word = tag(kUri);
    driver->Stop();
    EXPECT_FALSE(read(word, 1));
    expectError(-3, "Protocol not started");
}

TEST_F(TransactionTest, DelayPassesOncePerTransactionAndOutsideTheLock) {
    start("delay=25 repeat=2");
    port.silence();
    port.silence();
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    ASSERT_EQ(1U, host.multiTask.sleeps().size());
    EXPECT_EQ(25, host.multiTask.sleeps()[0].ms);
    EXPECT_FALSE(host.multiTask.sleeps()[0].lockHeld);
}

TEST_F(TransactionTest, NoDelayMeansNoSleep) {
    start("delay=0");
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_TRUE(host.multiTask.sleeps().empty());
}

TEST_F(TransactionTest, DelayOfTheNodeCounts) {
    start("delay=25 Node2::delay=0");
    port.reply(rtuFrame(hex("02 03 02 12 34")));
    ASSERT_TRUE(read(tag("2?HREG?400001?unsignedShort"), 1));
    EXPECT_TRUE(host.multiTask.sleeps().empty());
}

TEST_F(TransactionTest, OneLockingSpansAllAttempts) {
    start("repeat=2");
    const int before = host.multiTask.timesLocked();
    port.silence();
    port.silence();
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(before + 1, host.multiTask.timesLocked());
}

TEST_F(TransactionTest, RepeatCountsTheRetries) {
    for (const int repeat : {0, 1, 2, 5}) {
        SCOPED_TRACE(repeat);
        start("repeat=" + std::to_string(repeat));
        port.forget();
        for (int attempt = 0; attempt <= repeat; ++attempt)
            port.silence();
        EXPECT_FALSE(readOne());
        expectError(-4, "No response");
        EXPECT_EQ(static_cast<std::size_t>(repeat) + 1, port.sent().size());
        driver->Stop();
    }
}

TEST_F(TransactionTest, NegativeRepeatSendsNothing) {
    for (const char* repeat : {"repeat=-1", "repeat=-5"}) {
        SCOPED_TRACE(repeat);
        start(repeat);
        EXPECT_FALSE(readOne());
        expectError(-4, "No response");
        EXPECT_EQ(0, write(tag(kUri), hex("34 12"), 1));
        expectError(-4, "No response");
        driver->Stop();
    }
    EXPECT_TRUE(port.sent().empty());
}

TEST_F(TransactionTest, RetriesSendTheSameRequestAgain) {
    start("repeat=2");
    port.silence();
    port.reply(hex("01 03 02 12 34 00 00"));
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(kRequest + ", " + kRequest + ", " + kRequest, sent());
}

TEST_F(TransactionTest, GoodReplyEndsTheAttempts) {
    start("repeat=5");
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(1U, port.sent().size());
}

/// Only frames are worth another attempt; a well-formed answer is an answer.
TEST_F(TransactionTest, WrongAnswersAreNotRetried) {
    start("repeat=5");
    for (const char* answer : {"02 03 02 12 34", "01 83 02", "01 04 02 12 34", "01 03 04 12 34"}) {
        port.forget();
        port.reply(rtuFrame(hex(answer)));
        EXPECT_FALSE(readOne()) << answer;
        EXPECT_EQ(1U, port.sent().size()) << answer;
    }
}

TEST_F(TransactionTest, PendingInputIsFlushedByteByByte) {
    start();
    port.pushInput(hex("01 02 03"));
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ("01 02 03", toHex(port.flushed()));
    EXPECT_EQ(4, port.looks()) << "until the port reports nothing";
    EXPECT_EQ("34 12", toHex(got(2)));
}

TEST_F(TransactionTest, LateReplyIsFlushedBeforeTheNextAttempt) {
    start("repeat=1");
    port.late(rtuFrame(hex("01 03 02 AB CD")));
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(toHex(rtuFrame(hex("01 03 02 AB CD"))), toHex(port.flushed()));
    EXPECT_EQ("34 12", toHex(got(2)));
}

TEST_F(TransactionTest, LateReplyOfAnEarlierTransactionIsFlushed) {
    start("repeat=0");
    port.late(rtuFrame(hex("01 03 02 AB CD")));
    EXPECT_FALSE(readOne());
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ("34 12", toHex(got(2)));
}

TEST_F(TransactionTest, BabblingLineDoesNotHoldTheFlushForEver) {
    start("repeat=0");
    port.babble(0x55);
    port.reply(kGood);
    ASSERT_TRUE(readOne());
    EXPECT_EQ(65536U, port.flushed().size());
}

TEST_F(TransactionTest, RefusedSendLeavesTheLineFree) {
    start("repeat=1");
    port.failSend();
    port.reply(kGood);
    EXPECT_TRUE(readOne());
    EXPECT_EQ(2U, port.sent().size());
}

TEST_F(TransactionTest, LockIsFreeAfterEveryOutcome) {
    start("repeat=0");
    const Tag_MRTU* word = tag(kUri);
    const Tag_MRTU* disabled = tag("255?HREG?400001?unsignedShort");
    const Tag_MRTU* broadcast = tag("0?HREG?400001?unsignedShort");
    EXPECT_FALSE(read(disabled, 1));
    EXPECT_FALSE(host.multiTask.anyLockHeld());
    EXPECT_FALSE(read(broadcast, 1));
    EXPECT_FALSE(host.multiTask.anyLockHeld());
    for (const Bytes& answer :
         {Bytes{}, hex("01"), hex("01 03 02 12 34 00 00"), rtuFrame(hex("02 03 02 12 34")),
          rtuFrame(hex("01 83 02")), rtuFrame(hex("01 04 02 12 34")), rtuFrame(hex("01 03 01 12")),
          kGood}) {
        port.reply(answer);
        read(word, 1);
        EXPECT_FALSE(host.multiTask.anyLockHeld()) << toHex(answer);
    }
}

TEST_F(TransactionTest, CommonChecksRunInOrder) {
    start("repeat=0");
    const std::pair<const char*, const char*> cases[] = {
        {"02 03 02 12 34", "Incorrect node address in response"},
        {"02 83 02", "Incorrect node address in response"},
        {"01 83 02", "Exception: Illegal data address"},
        {"01 83 07", "Unknown exception"},
        {"01 83 0B", "Exception: gateway: timeout from target"},
        {"01 84 02", "Incorrect operation in response"},
        {"01 04 02 12 34", "Incorrect operation in response"},
        {"01 04 04 12 34", "Incorrect operation in response"},
        {"01 03 04 12 34", "Incorrect data length received"},
    };
    for (const auto& [answer, text] : cases) {
        SCOPED_TRACE(answer);
        plantError();
        port.reply(rtuFrame(hex(answer)));
        EXPECT_FALSE(readOne());
        expectError(-6, text);
    }
}

TEST_F(TransactionTest, ExceptionReplyIsAcceptedAtFiveBytes) {
    start("repeat=0");
    const Bytes answer = rtuFrame(hex("01 83 04"));
    ASSERT_EQ(5U, answer.size());
    port.reply(answer);
    EXPECT_FALSE(readOne());
    expectError(-6, "Exception: Failure in device");
}

TEST_F(TransactionTest, SuccessDoesNotClearAnEarlierError) {
    start("repeat=0");
    port.silence();
    EXPECT_FALSE(readOne());
    port.reply(kGood);
    EXPECT_TRUE(readOne());
    expectError(-4, "No response");
}

}  // namespace
