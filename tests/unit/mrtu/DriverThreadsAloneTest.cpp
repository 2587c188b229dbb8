// Several threads on one line.
#include <atomic>
#include <future>
#include <latch>
#include <thread>

#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::rtuFrame;
using testing_support::registersReply;
using testing_support::rtuMessage;

class DriverThreadsAloneTest : public DriverTest {
  protected:
    /// A slave whose register n holds n.
    static Bytes answer(const Bytes& frame) {
        const Bytes message = rtuMessage(frame);
        const auto address = static_cast<std::uint16_t>(message[2] * 256 + message[3]);
        return rtuFrame(registersReply(message[0], message[1], {address}));
    }
};

TEST_F(DriverThreadsAloneTest, EveryThreadGetsItsOwnAnswer) {
    start();
    port.answerWith(answer);
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    std::atomic<int> wrong = 0;
    constexpr int kThreads = 4;
    std::vector<std::thread> threads;
    threads.reserve(kThreads);
    for (int thread = 0; thread < kThreads; ++thread)
        threads.emplace_back([this, word, thread, &wrong] {
            for (int i = 0; i < 500; ++i) {
                const int index = thread * 1000 + i;
                unsigned char data[2] = {};
                const bool done = driver->doReadBlock(word, index, data, 1);
                if (!done || data[0] + data[1] * 256 != index) ++wrong;
            }
        });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(0, wrong);
    EXPECT_EQ(2000U, port.sent().size());
}

/// While one thread waits for its answer, another one's Stop() waits for the lock; the port goes
/// only after the exchange.
TEST_F(DriverThreadsAloneTest, StopWaitsForTheRunningTransaction) {
    start("repeat=0");
    port.answerWith(answer);
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    std::promise<void> stopping;
    std::thread stopper;
    port.onSend([this, &stopping, &stopper](const Bytes&) {
        stopper = std::thread([this, &stopping] {
            stopping.set_value();
            driver->Stop();
        });
        stopping.get_future().wait();
        EXPECT_EQ(0, host.serialFactory.released());
    });
    unsigned char data[2] = {};
    EXPECT_TRUE(driver->doReadBlock(word, 5, data, 1));
    EXPECT_EQ(5, data[0]);
    stopper.join();
    EXPECT_EQ(1, host.serialFactory.released());
}

/// A transaction that was waiting for the lock while Stop() held it finds no port any more.
TEST_F(DriverThreadsAloneTest, TransactionBehindAStopFindsTheLineClosed) {
    start("repeat=0 delay=1");
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    std::atomic<bool> go = false;
    std::thread reader([this, word, &go] {
        while (!go)
            std::this_thread::yield();
        unsigned char data[2];
        for (int i = 0; i < 100; ++i)
            driver->doReadBlock(word, 5, data, 1);
    });
    port.answerWith(answer);
    go = true;
    driver->Stop();
    reader.join();
    EXPECT_EQ(1, host.serialFactory.released());
    EXPECT_FALSE(host.multiTask.anyLockHeld());
}

/// A thread passes the first look at the state, pauses, and takes the line only when the driver was
/// stopped and is about to start again: the port is open by then, but nobody has set it up.
TEST_F(DriverThreadsAloneTest, TransactionThatWaitedThroughAStopKeepsOffAPortThatIsBeingStarted) {
    start("repeat=0 delay=1");
    port.answerWith(answer);
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    std::latch paused(1);
    std::latch startedAgain(1);
    std::latch finished(1);
    host.multiTask.onSleep([&] {
        paused.count_down();
        startedAgain.wait();
    });
    bool done = true;
    std::thread reader([&] {
        unsigned char data[2] = {};
        done = driver->doReadBlock(word, 5, data, 1);
        finished.count_down();
    });
    paused.wait();
    driver->Stop();
    port.onConfigure([&] {
        startedAgain.count_down();
        finished.wait();
    });
    EXPECT_NE(0, driver->Start());
    reader.join();
    EXPECT_FALSE(done);
    EXPECT_EQ("", sent());
    expectError(-3, "Protocol not started");
}

TEST_F(DriverThreadsAloneTest, StopWaitsForThePortToBeSetUpBySpDone) {
    start();
    const Tag_MRTU* apply = tag("1?SP_Done?0?boolean");
    std::latch stopping(1);
    std::thread stopper;
    port.onConfigure([&] {
        stopper = std::thread([&] {
            stopping.count_down();
            driver->Stop();
        });
        stopping.wait();
        EXPECT_EQ(0, host.serialFactory.released());
    });
    const unsigned char any = 1;
    EXPECT_NE(0, driver->doWrite(apply, 0, &any, 1));
    stopper.join();
    EXPECT_EQ(1, host.serialFactory.released());
}

/// Two threads start at once: the port is opened by one of them.
TEST_F(DriverThreadsAloneTest, TwoStartsOpenThePortOnce) {
    configure();
    std::latch bothThere(2);
    const auto startOnce = [&] {
        bothThere.arrive_and_wait();
        EXPECT_NE(0, driver->Start());
    };
    std::thread first(startOnce);
    std::thread second(startOnce);
    first.join();
    second.join();
    EXPECT_EQ(1U, host.serialFactory.opened().size());
}

/// A write of one bit is a read and a write of its register; were they not one step, a thread would
/// now and then put back the other one's old bit.
TEST_F(DriverThreadsAloneTest, TwoThreadsFlippingBitsOfOneRegisterLoseNoUpdate) {
    std::uint16_t holding = 0;  // Guarded by the line's lock, as on a real line.
    start();
    port.answerWith([&holding](const Bytes& frame) {
        const Bytes message = rtuMessage(frame);
        if (message[1] == 3) return rtuFrame(registersReply(1, 3, {holding}));
        holding = static_cast<std::uint16_t>(message[7] * 256 + message[8]);
        return rtuFrame(testing_support::writeReply(1, 16, 0, 1));
    });

    std::atomic<int> lost = 0;
    const auto flip = [this, &lost](const Tag_MRTU* bit) {
        for (int round = 0; round < 10000; ++round) {
            const unsigned char wanted = round % 2 == 0 ? 1 : 0;
            unsigned char found = 2;
            if (driver->Write(bit, &wanted) == 0 || driver->Read(bit, &found) == 0) ++lost;
            if (found != wanted) ++lost;
        }
    };
    std::thread first(flip, tag("1?HREG?400001.3?boolean"));
    std::thread second(flip, tag("1?HREG?400001.12?boolean"));
    first.join();
    second.join();
    EXPECT_EQ(0, lost);
    EXPECT_EQ(0, holding);
}

}  // namespace
