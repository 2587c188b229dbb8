// The loop of a poll: when it ends, and what it hands on. Time is the test's own.
#include "cli/poll/PollRun.h"

#include <gtest/gtest.h>

#include <deque>

#include "cli/poll/PollOutputs.h"
#include "tests/unit/cli/poll/PollSamples.h"

namespace {

using namespace std::chrono_literals;
using cli::ExitCode;
using cli::Happened;

class FakeClock final : public poll::Clock {
  public:
    TimePoint now() override { return TimePoint{} + passed; }
    WallTime wall() override { return cli_test::noon() + passed; }
    std::chrono::milliseconds passed{0};
};

class FakePolled final : public cli::Polled {
  public:
    [[nodiscard]] const cli::ShownTags& tags() const override { return tags_; }
    [[nodiscard]] poll::Snapshot snapshot() const override { return state; }
    std::optional<std::string> reload() override {
        ++reloads;
        return refusal;
    }
    bool filesChanged() override {
        ++looks;
        return std::exchange(changed, false);
    }

    poll::Snapshot state = cli_test::sampleSnapshot();
    std::optional<std::string> refusal;
    bool changed = false;
    int reloads = 0;
    int looks = 0;

  private:
    cli::ShownTags tags_ = cli_test::sampleTags();
};

class FakeOutput final : public cli::PollOutput {
  public:
    bool show(const cli::ShownTags&, const poll::Snapshot&,
              std::chrono::system_clock::time_point) override {
        ++shown;
        return shown < goneAfter;
    }
    bool take(const Happened& happened) override { return happened.typed != "q"; }
    void changeTags(const cli::ShownTags&) override { ++changes; }
    void notice(const std::string& text) override { notices.push_back(text); }

    int shown = 0;
    int goneAfter = 1000;
    int changes = 0;
    std::vector<std::string> notices;
};

/// What happens at each wait; then SIGTERM comes.
class ScriptedEvents final : public cli::PollEvents {
  public:
    explicit ScriptedEvents(FakeClock& clock) : clock_(clock) {}
    Happened wait(std::chrono::milliseconds time) override {
        clock_.passed += time;
        ++waits;
        if (onWait) onWait(waits);
        if (script.empty()) return {.end = true};
        const Happened next = script.front();
        script.pop_front();
        return next;
    }
    std::deque<Happened> script;
    std::function<void(int)> onWait;
    int waits = 0;

  private:
    FakeClock& clock_;
};

class PollRunTest : public testing::Test {
  protected:
    ExitCode run(const cli::PollLimits& limits = {}) {
        return runPoll(polled_, output_, events_, clock_, limits);
    }

    FakeClock clock_;
    FakePolled polled_;
    FakeOutput output_;
    ScriptedEvents events_{clock_};
};

TEST_F(PollRunTest, EndsOnASignalWithoutAFailure) {
    EXPECT_EQ(ExitCode::Done, run());
    EXPECT_EQ(1, output_.shown);
}

TEST_F(PollRunTest, EndsWhenTheUserDoes) {
    events_.script = {{}, {.typed = "q"}, {}};
    EXPECT_EQ(ExitCode::Done, run());
    EXPECT_EQ(2, events_.waits);
}

TEST_F(PollRunTest, EndsWhenNobodyReads) {
    events_.script.assign(10, {});
    output_.goneAfter = 3;
    EXPECT_EQ(ExitCode::Done, run());
    EXPECT_EQ(3, output_.shown);
    output_.goneAfter = 1000;
    events_.script = {{}, {.outputGone = true}, {}};
    EXPECT_EQ(ExitCode::Done, run());
    EXPECT_EQ(1U, events_.script.size());
}

TEST_F(PollRunTest, EndsAfterTheDurationAndNotLater) {
    events_.script.assign(100, {});
    EXPECT_EQ(ExitCode::Done, run({.duration = 2s, .pause = 300ms}));
    EXPECT_EQ(2000ms, clock_.passed);
}

TEST_F(PollRunTest, EndsAfterTheCyclesWithTheFirstFailure) {
    events_.script.assign(100, {});
    events_.onWait = [this](int waits) {
        polled_.state.line.cycles = static_cast<std::uint64_t>(waits);
    };
    EXPECT_EQ(ExitCode::BadReply, run({.cycles = 3}));
    EXPECT_EQ(3, events_.waits);
}

TEST_F(PollRunTest, LooksAtTheFilesOnceASecond) {
    events_.script.assign(30, {});
    run({.pause = 100ms});
    EXPECT_EQ(3, polled_.looks);
    EXPECT_EQ(0, polled_.reloads);
}

TEST_F(PollRunTest, ReloadsChangedFilesAndOnSighup) {
    events_.script.assign(11, {});
    polled_.changed = true;
    run();
    EXPECT_EQ(1, polled_.reloads);
    EXPECT_EQ(2, output_.changes) << "at the start and once more";
    events_.script = {{.reload = true}};
    run();
    EXPECT_EQ(2, polled_.reloads);
}

TEST_F(PollRunTest, NamesWhyNothingWasTaken) {
    events_.script = {{.reload = true}};
    polled_.refusal = "tags: /x/tags.csv: No such file or directory";
    run();
    EXPECT_EQ(1, output_.changes);
    ASSERT_EQ(1U, output_.notices.size());
    EXPECT_EQ("tags: /x/tags.csv: No such file or directory; the plan in force stays",
              output_.notices[0]);
}

TEST_F(PollRunTest, OneCycleIsDoneWhenEveryTagWasTried) {
    poll::Snapshot snapshot = cli_test::sampleSnapshot();
    EXPECT_TRUE(cli::cyclesDone(snapshot, 1));
    EXPECT_FALSE(cli::cyclesDone(snapshot, 2));
    snapshot.tags[1] = {};
    EXPECT_FALSE(cli::cyclesDone(snapshot, 1));
}

TEST_F(PollRunTest, SilentNodesAndLostPortsEndTheCycles) {
    poll::Snapshot snapshot = cli_test::sampleSnapshot();
    snapshot.nodes[0].reachable = false;
    EXPECT_TRUE(cli::cyclesDone(snapshot, 5));
    snapshot.tags = {{}, {}, {}};
    EXPECT_FALSE(cli::cyclesDone(snapshot, 5));
    snapshot.line.open = false;
    EXPECT_FALSE(cli::cyclesDone(snapshot, 5)) << "not tried to open yet";
    snapshot.line.fault = "no such device";
    EXPECT_TRUE(cli::cyclesDone(snapshot, 5));
    EXPECT_EQ(ExitCode::Port, cli::exitCodeOf(snapshot));
}

TEST_F(PollRunTest, TheFirstFailingTagDecides) {
    poll::Snapshot snapshot = cli_test::sampleSnapshot();
    snapshot.tags[1].error = {-4, "no response"};
    EXPECT_EQ(ExitCode::NoResponse, cli::exitCodeOf(snapshot));
    snapshot.tags.resize(1);
    EXPECT_EQ(ExitCode::Done, cli::exitCodeOf(snapshot));
    snapshot.tags.clear();
    EXPECT_EQ(ExitCode::Done, cli::exitCodeOf(snapshot));
}

}  // namespace
