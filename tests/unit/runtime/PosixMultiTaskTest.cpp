#include "runtime/PosixMultiTask.h"

#include <gtest/gtest.h>
#include <pthread.h>

#include <atomic>
#include <chrono>
#include <csignal>
#include <thread>
#include <vector>

namespace {

using runtime::PosixMultiTask;

TEST(PosixMultiTaskTest, LockLetsOneThreadInAtATime) {
    PosixMultiTask tasks;
    ILock* lock = tasks.createLock(0);
    int counter = 0;
    const auto count = [&] {
        for (int round = 0; round < 10'000; ++round) {
            lock->lock();
            ++counter;
            lock->unlock();
        }
    };
    std::vector<std::thread> threads;
    threads.reserve(4);
    for (int i = 0; i < 4; ++i)
        threads.emplace_back(count);
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(40'000, counter);
    tasks.deleteLock(lock);
}

TEST(PosixMultiTaskTest, CountsItsLocks) {
    PosixMultiTask tasks;
    ILock* first = tasks.createLock(0);
    ILock* second = tasks.createLock(0);
    EXPECT_NE(first, second);
    EXPECT_EQ(2, tasks.locks());
    tasks.deleteLock(first);
    tasks.deleteLock(second);
    tasks.deleteLock(nullptr);
    EXPECT_EQ(0, tasks.locks());
}

TEST(PosixMultiTaskTest, AnswersToItsNameOnly) {
    PosixMultiTask tasks;
    EXPECT_EQ(static_cast<IMultiTask2*>(&tasks), tasks.ConvertTo("IMultiTask2"));
    EXPECT_EQ(nullptr, tasks.ConvertTo("IMultiTask"));
}

std::atomic<int> signalsSeen{0};

TEST(PosixMultiTaskTest, SignalsDoNotCutASleepShort) {
    struct sigaction action {};
    action.sa_handler = [](int) { ++signalsSeen; };
    struct sigaction before {};
    ASSERT_EQ(0, ::sigaction(SIGUSR1, &action, &before));

    using Clock = std::chrono::steady_clock;
    constexpr std::chrono::milliseconds kSleep{50};
    std::atomic<bool> awake{false};
    const pthread_t sleeper = ::pthread_self();
    std::thread disturber([&] {
        while (!awake) {
            ::pthread_kill(sleeper, SIGUSR1);
            std::this_thread::sleep_for(std::chrono::milliseconds{1});
        }
    });
    const Clock::time_point start = Clock::now();
    PosixMultiTask().sleep(static_cast<int>(kSleep.count()));
    const Clock::duration slept = Clock::now() - start;
    awake = true;
    disturber.join();
    ::sigaction(SIGUSR1, &before, nullptr);
    // A lower bound only: how much longer it took is the system's business.
    EXPECT_GE(slept, kSleep);
    EXPECT_GT(signalsSeen, 0);
}

TEST(PosixMultiTaskTest, NothingToSleepReturns) {
    PosixMultiTask tasks;
    tasks.sleep(0);
    tasks.sleep(-1'000'000'000);
    SUCCEED() << "a wait for this long would end in the test's time limit";
}

}  // namespace
