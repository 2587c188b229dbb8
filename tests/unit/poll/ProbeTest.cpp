// How long a lost node is waited for.
#include <gtest/gtest.h>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

/// A line whose devices note how long probes wait.
class ProbedSource final : public BlockSource {
  public:
    ProbedSource(std::vector<milliseconds>& waits, FakeDevices& devices, FakeClock& clock)
        : waits_(waits), inner_(devices, clock) {}
    std::vector<TagReading> read(const Block& block) override { return inner_.read(block); }
    std::vector<TagReading> probe(const Block& block, milliseconds wait) override {
        waits_.push_back(wait);
        return inner_.read(block);
    }
    std::optional<ReadError> write(std::size_t tag, std::span<const std::uint8_t> value) override {
        return inner_.write(tag, value);
    }
    bool open() override { return inner_.open(); }
    void close() override { inner_.close(); }
    bool gone() const override { return inner_.gone(); }

  private:
    std::vector<milliseconds>& waits_;
    FakeSource inner_;
};

class ProbeTest : public testing::Test {
  protected:
    void run(milliseconds time) {
        const auto end = clock_.now() + time;
        while (clock_.now() < end) {
            const auto next = std::min(machine_.step(), end);
            if (next > clock_.now()) clock_.advance(next - clock_.now());
        }
    }

    FakeClock clock_;
    FakeDevices devices_;
    std::vector<milliseconds> waits_;
    LineMachine machine_{SetupBuilder().block(1, 0, 1, milliseconds{100}).shared(),
                         std::make_unique<ProbedSource>(waits_, devices_, clock_), clock_,
                         [](const FaultEvent&) {}};
};

TEST_F(ProbeTest, NodeThatHasAnsweredIsWaitedForTwiceTheTimeThatItEverTook) {
    devices_.answer = milliseconds{70};
    run(seconds{1});
    devices_.dead = {1};
    run(seconds{5});
    ASSERT_FALSE(waits_.empty());
    for (const milliseconds wait : waits_)
        EXPECT_EQ(milliseconds{140}, wait);
}

TEST_F(ProbeTest, QuickNodeIsGivenAMomentMore) {
    devices_.answer = milliseconds{3};
    run(seconds{1});
    devices_.dead = {1};
    run(seconds{5});
    ASSERT_FALSE(waits_.empty());
    EXPECT_EQ(milliseconds{50}, waits_.front());
}

TEST_F(ProbeTest, NodeThatHasNeverAnsweredIsWaitedForAsLongAsEver) {
    devices_.dead = {1};
    run(seconds{5});
    ASSERT_FALSE(waits_.empty());
    for (const milliseconds wait : waits_)
        EXPECT_EQ(milliseconds{0}, wait);
}

}  // namespace
}  // namespace poll
