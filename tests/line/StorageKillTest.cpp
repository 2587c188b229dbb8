// Processes that are killed while they write.
#include <fcntl.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <csignal>
#include <random>
#include <thread>

#include "posix/FileDescriptor.h"
#include "tests/line/StorageFile.h"

namespace {

using posix::FileDescriptor;
using runtime::SqliteStorage;

constexpr int kRounds = 200;
constexpr int kKeys = 8;
constexpr const char* kSection = "line1";

std::string keyOf(int write) {
    return "key" + std::to_string(write % kKeys);
}
/// Long enough to spill over pages now and then.
std::string valueOf(int write) {
    return std::to_string(write) + ":" + std::string(static_cast<std::size_t>(write) % 300, 'v');
}

/// Writes for ever, beginning with number `first`; tells each number when its write is done.
[[noreturn]] void writeForEver(const std::string& path, int first, int acknowledgements) {
    auto storage = SqliteStorage::open(path);
    if (!storage) ::_exit(1);
    for (int write = first;; ++write) {
        storage.value()->writeString(kSection, keyOf(write).c_str(), valueOf(write).c_str());
        if (storage.value()->failed()) ::_exit(2);
        if (::write(acknowledgements, &write, sizeof write) != sizeof write) ::_exit(3);
    }
}

/// @return the last number in the pipe, `before` when there is none. Waits for its closing.
int lastAcknowledged(int acknowledgements, int before) {
    int last = before;
    int number = 0;
    while (::read(acknowledgements, &number, sizeof number) == ssize_t{sizeof number}) {
        last = number;
    }
    return last;
}

struct StorageKillTest : StorageFileTest {
    /// Lets a child write until it is killed, `moment` after its start.
    /// @return the last number that it acknowledged.
    int killAfter(std::chrono::microseconds moment, int last) const {
        int ends[2];
        EXPECT_EQ(0, ::pipe(ends));
        FileDescriptor reading(ends[0]);
        FileDescriptor writing(ends[1]);
        const pid_t child = ::fork();
        if (child == 0) writeForEver(path, last + 1, ends[1]);
        writing = FileDescriptor();
        std::this_thread::sleep_for(moment);
        ::kill(child, SIGKILL);
        const int acknowledged = lastAcknowledged(reading.get(), last);
        EXPECT_EQ(-SIGKILL, endOf(child)) << "the child ended by itself";
        return acknowledged;
    }

    /// Every key holds its last acknowledged value, or the one that was under way.
    void expectAllAcknowledged(int last) const {
        const auto storage = open();
        ASSERT_NE(storage, nullptr);
        for (int write = std::max(0, last - kKeys + 1); write <= last; ++write) {
            const std::string stored = storage->readString(kSection, keyOf(write).c_str());
            const bool underWay = stored == valueOf(write + kKeys) && write + kKeys == last + 1;
            EXPECT_TRUE(stored == valueOf(write) || underWay)
                << keyOf(write) << " after write " << last << " holds " << stored.substr(0, 20);
        }
        EXPECT_FALSE(storage->failed()) << storage->lastError();
    }
};

TEST_F(StorageKillTest, AcknowledgedValuesSurviveTwoHundredKills) {
    constexpr int kRoundsPerFile = 20;
    const auto seed = std::random_device{}();
    SCOPED_TRACE("seed " + std::to_string(seed));
    std::mt19937 random(seed);
    std::uniform_int_distribution<int> moments(0, 60'000);
    int last = -1;
    int total = 0;
    int roundsWithWrites = 0;
    for (int round = 0; round < kRounds; ++round) {
        if (round % kRoundsPerFile == 0) {
            // A fresh file, so that kills also hit its creation.
            total += last + 1;
            last = -1;
            path = folder + "/overrides" + std::to_string(round) + ".db";
        }
        const int before = last;
        last = killAfter(std::chrono::microseconds(moments(random)), last);
        if (last > before) ++roundsWithWrites;
        if (std::filesystem::exists(path)) {
            ASSERT_EQ("ok\n", ask("PRAGMA integrity_check")) << "round " << round;
        }
        expectAllAcknowledged(last);
        if (HasFailure()) FAIL() << "in round " << round;
    }
    total += last + 1;
    // Else the kills came too early to prove anything.
    EXPECT_GE(roundsWithWrites, kRounds / 10);
    RecordProperty("acknowledged", total);
    RecordProperty("rounds_with_writes", roundsWithWrites);
}

}  // namespace
