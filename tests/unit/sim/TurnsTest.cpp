// The order in which nodes come to their requests.
#include "sim/Turns.h"

#include <gtest/gtest.h>

namespace sim {
namespace {

using namespace std::chrono_literals;
using wire::Bytes;

class TurnsTest : public testing::Test {
  protected:
    const Instant t0 = Instant(1h);
    Turns turns;
};

TEST_F(TurnsTest, ANodeBeginsItsNextRequestWhenItIsDone) {
    turns.add({.message = {1, 10}, .at = t0});
    turns.add({.message = {1, 20}, .at = t0 + 1ms});
    EXPECT_EQ((Bytes{1, 10}), turns.begin().value().message);
    EXPECT_FALSE(turns.begin());
    EXPECT_EQ(1U, turns.waiting());
    turns.end(1, t0 + 50ms);
    const Request second = turns.begin().value();
    EXPECT_EQ((Bytes{1, 20}), second.message);
    EXPECT_EQ(t0 + 50ms, second.at);
    EXPECT_EQ(0U, turns.waiting());
}

TEST_F(TurnsTest, ANodeThatIsFreeBeginsAtTheArrival) {
    turns.add({.message = {1, 10}, .at = t0});
    EXPECT_EQ(t0, turns.begin().value().at);
    turns.end(1, t0 + 50ms);
    turns.add({.message = {1, 20}, .at = t0 + 60ms});
    EXPECT_EQ(t0 + 60ms, turns.begin().value().at);
}

TEST_F(TurnsTest, NodesDoNotWaitForOneAnother) {
    turns.add({.message = {1, 10}, .at = t0});
    turns.add({.message = {1, 20}, .at = t0});
    turns.add({.message = {2, 30}, .at = t0});
    EXPECT_EQ((Bytes{1, 10}), turns.begin().value().message);
    EXPECT_EQ((Bytes{2, 30}), turns.begin().value().message);
    EXPECT_FALSE(turns.begin());
}

TEST_F(TurnsTest, TellsWhoIsAtWorkAndWhoWasStill) {
    EXPECT_FALSE(turns.busyAt(1, t0));
    turns.add({.message = {1, 10}, .at = t0});
    EXPECT_FALSE(turns.busyAt(1, t0)) << "it waits";
    turns.begin();
    EXPECT_TRUE(turns.busyAt(1, t0 + 1h));
    EXPECT_FALSE(turns.busyAt(2, t0));
    turns.end(1, t0 + 50ms);
    EXPECT_TRUE(turns.busyAt(1, t0 + 50ms - 1ns));
    EXPECT_FALSE(turns.busyAt(1, t0 + 50ms));
}

}  // namespace
}  // namespace sim
