// Who waits for whom, and in which order.
#include "engine/WriteTurns.h"

#include <gtest/gtest.h>

#include <atomic>
#include <latch>
#include <list>
#include <mutex>
#include <optional>
#include <string>
#include <thread>
#include <vector>

namespace {

using engine::WritePlace;
using engine::WriteTurns;
using Kind = WriteTurns::Kind;

constexpr WritePlace kHere{1, "REG"};

class WriteTurnsTest : public testing::Test {
  protected:
    /// A thread that waits for a turn, notes its name once it has it, and keeps it until released.
    class Writer {
      public:
        Writer(WriteTurnsTest& test, const std::string& name, const WritePlace& place, Kind kind)
            : thread_([this, &test, name, place, kind] {
                  const WriteTurns::Turn turn(test.turns_, place, kind);
                  test.note(name);
                  has_.count_down();
                  release_.wait();
              }) {}
        ~Writer() { finish(); }
        void awaitTurn() { has_.wait(); }
        void finish() {
            if (!thread_.joinable()) return;
            release_.count_down();
            thread_.join();
        }

      private:
        std::latch has_{1};
        std::latch release_{1};
        std::thread thread_;
    };

    /// A writer that is known to have its turn.
    Writer& active(const std::string& name, const WritePlace& place, Kind kind) {
        Writer& writer = writers_.emplace_back(*this, name, place, kind);
        writer.awaitTurn();
        return writer;
    }
    /// A writer that is known to wait.
    Writer& waiting(const std::string& name, const WritePlace& place, Kind kind) {
        const int before = turns_.waiting();
        Writer& writer = writers_.emplace_back(*this, name, place, kind);
        while (turns_.waiting() == before)
            std::this_thread::yield();
        return writer;
    }

    void note(const std::string& name) {
        const std::lock_guard lock(mutex_);
        order_ += order_.empty() ? name : ' ' + name;
    }
    std::string order() {
        const std::lock_guard lock(mutex_);
        return order_;
    }

    WriteTurns turns_;
    std::mutex mutex_;
    std::string order_;
    std::list<Writer> writers_;
};

TEST_F(WriteTurnsTest, RequestsToOnePlaceGoSideBySide) {
    active("a", kHere, Kind::Request);
    active("b", kHere, Kind::Request);
    EXPECT_EQ(0, turns_.waiting());
}

TEST_F(WriteTurnsTest, ChangeKeepsRequestsAndChangesOut) {
    Writer& change = active("change", kHere, Kind::Change);
    Writer& request = waiting("request", kHere, Kind::Request);
    Writer& other = waiting("other", kHere, Kind::Change);
    EXPECT_EQ("change", order());
    change.finish();
    request.awaitTurn();
    EXPECT_EQ("change request", order());
    request.finish();
    other.awaitTurn();
    EXPECT_EQ("change request other", order());
}

TEST_F(WriteTurnsTest, OtherNodesAndOtherAreasDoNotWait) {
    active("change", kHere, Kind::Change);
    active("node", {2, "REG"}, Kind::Change);
    active("area", {1, "LONG"}, Kind::Change);
    EXPECT_EQ(0, turns_.waiting());
}

TEST_F(WriteTurnsTest, AreaIsItsNameWhereverTheNameIsKept) {
    const std::string elsewhere = "REG";
    Writer& change = active("change", kHere, Kind::Change);
    Writer& request = waiting("request", {1, elsewhere}, Kind::Request);
    change.finish();
    request.finish();
}

TEST_F(WriteTurnsTest, FreeTurnWaitsForNobody) {
    active("change", kHere, Kind::Change);
    active("free", kHere, Kind::Free);
    EXPECT_EQ(0, turns_.waiting());
}

TEST_F(WriteTurnsTest, StreamOfRequestsDoesNotOvertakeAWaitingChange) {
    Writer& first = active("first", kHere, Kind::Request);
    Writer& change = waiting("change", kHere, Kind::Change);
    Writer& late = waiting("late", kHere, Kind::Request);
    Writer& later = waiting("later", kHere, Kind::Request);
    first.finish();
    change.awaitTurn();
    EXPECT_EQ("first change", order());
    EXPECT_EQ(2, turns_.waiting());
    change.finish();
    late.awaitTurn();
    later.awaitTurn();
}

TEST_F(WriteTurnsTest, StreamOfChangesDoesNotOvertakeAWaitingRequest) {
    Writer& first = active("first", kHere, Kind::Change);
    Writer& request = waiting("request", kHere, Kind::Request);
    waiting("late", kHere, Kind::Change);
    first.finish();
    request.awaitTurn();
    EXPECT_EQ("first request", order());
    request.finish();
}

TEST_F(WriteTurnsTest, ThreadThatHasATurnGetsAnotherOneThere) {
    const WriteTurns::Turn change(turns_, kHere, Kind::Change);
    Writer& other = waiting("other", kHere, Kind::Change);
    { const WriteTurns::Turn request(turns_, kHere, Kind::Request); }
    { const WriteTurns::Turn again(turns_, kHere, Kind::Change); }
    EXPECT_EQ(1, turns_.waiting());
    EXPECT_EQ("", order());
    static_cast<void>(other);
    // `change` ends before the writers are joined, and lets `other` go.
}

TEST_F(WriteTurnsTest, CountersOfManyThreadsLoseNothing) {
    int changed = 0;  // Only changes touch it.
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 8; ++thread)
        threads.emplace_back([this, thread, &changed] {
            for (int round = 0; round < 1000; ++round) {
                const bool change = (round + thread) % 2 == 0;
                const WriteTurns::Turn turn(turns_, kHere, change ? Kind::Change : Kind::Request);
                if (change) ++changed;
            }
        });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(4000, changed);
    EXPECT_EQ(0, turns_.waiting());
}

}  // namespace
