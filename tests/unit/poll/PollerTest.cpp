// Threads, real time and several lines; what a line does in which order is tested without them.
#include "poll/Poller.h"

#include <gtest/gtest.h>

#include <atomic>
#include <map>
#include <mutex>
#include <stdexcept>
#include <thread>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

/// What the lines' threads did, by line.
class Logbook {
  public:
    void note(const std::string& line, const std::string& what) {
        const std::lock_guard lock(mutex_);
        notes_[line] += what;
    }
    std::string of(const std::string& line) {
        const std::lock_guard lock(mutex_);
        return notes_[line];
    }

  private:
    std::mutex mutex_;
    std::map<std::string, std::string> notes_;
};

/// Answers at once with the number of the read.
class QuickSource final : public BlockSource {
  public:
    QuickSource(std::string line, Logbook& log) : line_(std::move(line)), log_(log) {}

    std::vector<TagReading> read(const Block& block) override {
        ++count_;
        return std::vector<TagReading>(block.tags.size(), TagReading{true, {count_}, {}});
    }
    std::optional<ReadError> write(std::size_t tag, std::span<const std::uint8_t>) override {
        log_.note(line_, "w" + std::to_string(tag) + " ");
        return std::nullopt;
    }
    bool open() override {
        log_.note(line_, "open ");
        return true;
    }
    void close() override { log_.note(line_, "close "); }
    bool gone() const override { return false; }

  private:
    std::string line_;
    Logbook& log_;
    std::uint8_t count_ = 0;
};

LineSetup lineOf(const std::string& name, const std::string& tagPrefix,
                 milliseconds period = milliseconds{1}) {
    SetupBuilder builder(name);
    builder.block(1, 0, 10, period);
    for (std::string& tag : builder.setup().tagNames)
        tag.insert(0, tagPrefix);
    return builder.setup();
}

class PollerTest : public testing::Test {
  protected:
    template <class Condition>
    static void waitFor(Condition condition) {
        while (!condition())
            std::this_thread::yield();
    }
    std::uint64_t countOf(std::size_t line) {
        return poller_.snapshot().at(line).snapshot.tags.at(0).count;
    }

    std::unique_ptr<BlockSource> make(const LineSetup& setup) {
        if (setup.configuration == "wrong") throw std::runtime_error(setup.name + ": no driver");
        ++made_;
        return std::make_unique<QuickSource>(setup.name, log_);
    }

    Logbook log_;
    int made_ = 0;
    SystemClock clock_;
    Poller poller_{[this](const LineSetup& setup) { return make(setup); }, clock_, {}};
};

TEST_F(PollerTest, LinesArePolledSideBySideUntilStopped) {
    EXPECT_FALSE(poller_.start({lineOf("com1", "a"), lineOf("com2", "b")}));
    waitFor([&] { return countOf(0) > 10 && countOf(1) > 10; });
    poller_.stop();
    const std::uint64_t count = countOf(0);
    EXPECT_EQ("open close ", log_.of("com1"));
    EXPECT_EQ("open close ", log_.of("com2"));
    EXPECT_EQ(count, countOf(0));
    EXPECT_EQ(Quality::Good, poller_.snapshot()[1].snapshot.tags[9].quality);
}

TEST_F(PollerTest, SnapshotsOfARunningLineNeverMixTwoReads) {
    poller_.start({lineOf("com1", "a")});
    waitFor([&] { return countOf(0) > 0; });
    for (int i = 0; i < 1000; ++i) {
        const Snapshot seen = poller_.snapshot()[0].snapshot;
        for (const TagState& tag : seen.tags) {
            ASSERT_EQ(seen.tags[0].value, tag.value);
            ASSERT_EQ(seen.tags[0].count, tag.count);
        }
    }
}

TEST_F(PollerTest, AWriteDoesNotWaitForTheNextPeriod) {
    poller_.start({lineOf("com1", "a", std::chrono::hours{1}), lineOf("com2", "b")});
    EXPECT_FALSE(poller_.write("at3", {1}).get());
    EXPECT_FALSE(poller_.write("bt0", {1}).get());
    EXPECT_EQ("open w3 ", log_.of("com1"));
    EXPECT_EQ((ReadError{-1, "No tag is named ct0"}), *poller_.write("ct0", {1}).get());
}

TEST_F(PollerTest, AWriteToAStoppedLineFails) {
    poller_.start({lineOf("com1", "a")});
    poller_.stop();
    EXPECT_EQ(-3, poller_.write("at0", {1}).get()->code);
}

TEST_F(PollerTest, ALineThatStaysTheSameIsNotTouchedByAReload) {
    poller_.start({lineOf("com1", "a"), lineOf("com2", "b")});
    waitFor([&] { return countOf(0) > 0 && log_.of("com2") == "open "; });
    LineSetup reworded = lineOf("com1", "a");
    reworded.blocks[0].reason = "told otherwise";
    EXPECT_FALSE(poller_.reload({lineOf("com3", "c"), reworded}));
    EXPECT_EQ("open ", log_.of("com1"));
    EXPECT_EQ("open close ", log_.of("com2"));
    EXPECT_EQ("com3", poller_.snapshot()[0].setup->name);
    EXPECT_EQ(3, made_);
}

TEST_F(PollerTest, AChangedLineKeepsWhatIsKnownOfItsTags) {
    poller_.start({lineOf("com1", "a")});
    waitFor([&] { return countOf(0) > 0; });
    LineSetup slower = lineOf("com1", "a", std::chrono::hours{1});
    slower.tagNames[5] = "new";
    const std::uint64_t before = countOf(0);
    EXPECT_FALSE(poller_.reload({slower}));
    waitFor([&] { return poller_.snapshot()[0].snapshot.tags[5].count == 1; });
    EXPECT_GT(countOf(0), before);
    EXPECT_EQ("open close open ", log_.of("com1"));
}

TEST_F(PollerTest, ABadSetupLeavesTheOldPlanInForce) {
    poller_.start({lineOf("com1", "a")});
    LineSetup wrong = lineOf("com2", "b");
    wrong.configuration = "wrong";
    EXPECT_EQ("com2: no driver", poller_.reload({lineOf("com3", "c"), wrong}));
    EXPECT_EQ("com2: tag at0 is polled twice",
              poller_.reload({lineOf("com1", "a"), lineOf("com2", "a")}));
    const std::uint64_t count = countOf(0);
    waitFor([&] { return countOf(0) > count; });
    EXPECT_EQ(1U, poller_.snapshot().size());
    EXPECT_EQ("open ", log_.of("com1"));
    EXPECT_EQ("", log_.of("com3"));
}

}  // namespace
}  // namespace poll
