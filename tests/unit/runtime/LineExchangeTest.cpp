#include "runtime/LineExchange.h"

#include <gmock/gmock.h>

#include <array>

#include "tests/unit/runtime/FakeLine.h"
#include "tests/unit/runtime/FakeRules.h"

namespace {

using namespace runtime;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using Bytes = FakeRules::Bytes;

constexpr Milliseconds kTimeout = 100ms;
constexpr Milliseconds kGap = 13ms;

/// A driver that flushes, sends and waits. 10 bits at 10000 baud: 1 ms a character.
struct LineExchangeTest : ::testing::Test {
    LineExchangeTest() { options.rules = std::make_shared<FakeRules>(); }

    LineExchange& port() {
        if (!port_) {
            options.port = "com1";
            options.report = [this](const std::string& text) { reports.push_back(text); };
            options.thrownAway = [this](ByteView frame) {
                thrownAway.emplace_back(frame.begin(), frame.end());
            };
            port_ = std::make_unique<LineExchange>(line, options);
            port_->setFormat(10000, 10);
        }
        return *port_;
    }
    void flush() {
        std::uint8_t late = 0;
        while (port().receiveByte(late, 0ms) == Transfer::Complete) {
        }
    }
    bool send(const Bytes& request) {
        return port().clearToSend(request) && port().transmit(request, false) == Transfer::Complete;
    }
    Bytes receive() {
        std::uint8_t first = 0;
        how = port().receiveByte(first, kTimeout);
        if (how != Transfer::Complete) return {};
        std::array<std::uint8_t, 512> rest{};
        const FrameEnd end = port().receiveFrame(rest, kTimeout, kGap);
        how = end.how;
        Bytes frame{first};
        frame.insert(frame.end(), rest.begin(),
                     rest.begin() + static_cast<std::ptrdiff_t>(end.count));
        return frame;
    }
    Bytes exchange(const Bytes& request) {
        flush();
        if (!send(request)) return {};
        return receive();
    }
    /// The reply comes so long after the start.
    void arrive(int atMs, const Bytes& bytes) { line.arrive(atMs, bytes); }
    void wait(int untilMs) {
        line.sleepUntil(line.now() + std::chrono::milliseconds(untilMs - line.elapsedMs()));
    }

    FakeLine line;
    ExchangeOptions options;
    std::vector<std::string> reports;
    std::vector<Bytes> thrownAway;
    Transfer how = Transfer::Complete;

  private:
    std::unique_ptr<LineExchange> port_;
};

const Bytes kA = FakeRules::request(1, 2, 'a');
const Bytes kB = FakeRules::request(1, 2, 'b');
const Bytes kLong = FakeRules::request(1, 60, 'l');
const Bytes kReplyA = FakeRules::reply(1, 2, 0x0A);
const Bytes kReplyB = FakeRules::reply(1, 2, 0x0B);
const Bytes kLongReply = FakeRules::reply(1, 60);

TEST_F(LineExchangeTest, OneExchangeWithTheGapTakesFiveCalls) {
    arrive(20, kReplyA);
    EXPECT_EQ(kReplyA, exchange(kA));
    // Look, write, wait, read, wait out the gap.
    EXPECT_EQ(5, line.calls());
    EXPECT_EQ(20 + 13, line.elapsedMs());
}

TEST_F(LineExchangeTest, OneExchangeByLengthTakesFourCallsAndTheSilence) {
    options.frameEnd = FrameEndBy::Length;
    arrive(20, kReplyA);
    EXPECT_EQ(kReplyA, exchange(kA));
    EXPECT_EQ(4, line.calls());
    EXPECT_EQ(20, line.elapsedMs());
    arrive(40, kReplyB);
    EXPECT_EQ(kReplyB, exchange(kB));
    EXPECT_EQ(4 + 5, line.calls());
}

// An echo may begin with a valid reply, and a retry finds the first attempt's reply still owed.
TEST_F(LineExchangeTest, WhatSilenceEndsIsHandedOutWholeAlsoWhenItBeginsWithAReply) {
    Bytes echo = kReplyA;
    echo.push_back(0);
    arrive(10, echo);
    EXPECT_EQ(echo, exchange(kA));
    arrive(60, echo);
    EXPECT_EQ(echo, exchange(kA));
    Bytes withReply = echo;
    withReply.insert(withReply.end(), kReplyA.begin(), kReplyA.end());
    arrive(110, withReply);
    EXPECT_EQ(withReply, exchange(kA));
    EXPECT_THAT(thrownAway, ::testing::IsEmpty());
}

TEST_F(LineExchangeTest, SilenceIsKeptBeforeTheNextRequest) {
    options.frameEnd = FrameEndBy::Length;
    arrive(20, kReplyA);
    exchange(kA);
    ASSERT_TRUE(send(kB));
    EXPECT_EQ(20 + 4, line.elapsedMs());
}

TEST_F(LineExchangeTest, SilenceThatTheGapHasKeptIsNotKeptAgain) {
    arrive(20, kReplyA);
    exchange(kA);
    ASSERT_TRUE(send(kB));
    EXPECT_EQ(20 + 13, line.elapsedMs());
}

TEST_F(LineExchangeTest, TimeoutRunsFromTheEndOfTheRequestsCharacters) {
    arrive(102, kReplyA);
    EXPECT_EQ(kReplyA, exchange(kA));
    arrive(line.elapsedMs() + 104, kReplyB);
    EXPECT_EQ(Bytes{}, exchange(kB));
}

TEST_F(LineExchangeTest, SlowReplyWakesTheReceiverAFewTimesOnly) {
    for (int i = 0; i < 62; ++i) {
        arrive(10 + i, {i == 0 ? std::uint8_t{1} : i == 1 ? std::uint8_t{60} : std::uint8_t{0x11}});
    }
    EXPECT_EQ(kLongReply, exchange(kLong));
    EXPECT_LT(line.waits(), 62 / 4);
}

TEST_F(LineExchangeTest, SlowReplyByLengthWakesTheReceiverTwice) {
    options.frameEnd = FrameEndBy::Length;
    for (int i = 0; i < 62; ++i) {
        arrive(10 + i, {i == 0 ? std::uint8_t{1} : i == 1 ? std::uint8_t{60} : std::uint8_t{0x11}});
    }
    EXPECT_EQ(kLongReply, exchange(kLong));
    EXPECT_LE(line.waits(), 3);
    EXPECT_LE(line.elapsedMs(), 10 + 62);
}

TEST_F(LineExchangeTest, PauseInsideAReplyDoesNotCutItByLength) {
    options.frameEnd = FrameEndBy::Length;
    arrive(20, {1, 2});
    arrive(60, {0x0A, 0x0A});
    EXPECT_EQ(kReplyA, exchange(kA));
    EXPECT_THAT(reports, ElementsAre());
}

TEST_F(LineExchangeTest, ReplyWithoutItsRestEndsAtTheDeadlineByLength) {
    options.frameEnd = FrameEndBy::Length;
    arrive(20, {1, 2, 0x0A});
    EXPECT_EQ((Bytes{1, 2, 0x0A}), exchange(kA));
    EXPECT_EQ(Transfer::TimedOut, how);
    EXPECT_EQ(20 + 100, line.elapsedMs());
}

TEST_F(LineExchangeTest, WhatIsNoReplyEndsBySilenceAlsoByLength) {
    options.frameEnd = FrameEndBy::Length;
    arrive(20, {7, 7, 7});
    EXPECT_EQ((Bytes{7, 7, 7}), exchange(kA));
    EXPECT_EQ(20 + 13, line.elapsedMs());
}

TEST_F(LineExchangeTest, CutReplyIsReportedOnceWithTheGapToSet) {
    for (const int at : {0, 1000}) {
        wait(at);
        arrive(at + 20, {1, 2});
        arrive(at + 40, {0x0A, 0x0A});
        EXPECT_EQ((Bytes{1, 2}), exchange(kA));
        wait(at + 45);
        EXPECT_EQ(Bytes{}, exchange(kA));
    }
    EXPECT_THAT(reports,
                ElementsAre("com1: a reply paused for 25 ms, longer than the gap of 13 ms, and was "
                            "cut: --min-gap 40 or --frame-end length keeps it whole"));
}

TEST_F(LineExchangeTest, RestOfACutReplyIsNotHandedOutAsTheRepetitionsReply) {
    arrive(20, {1, 2});
    arrive(40, {0x0A, 0x0A});
    arrive(60, kReplyA);
    EXPECT_EQ((Bytes{1, 2}), exchange(kA));
    EXPECT_EQ(kReplyA, exchange(kA));
}

TEST_F(LineExchangeTest, RestOfACutReplyIsKnownAlsoRightBeforeTheRepetitionsReply) {
    arrive(20, {1, 2});
    Bytes restAndReply{0x0A, 0x0A};
    restAndReply.insert(restAndReply.end(), kReplyA.begin(), kReplyA.end());
    arrive(60, restAndReply);
    EXPECT_EQ((Bytes{1, 2}), exchange(kA));
    EXPECT_EQ(kReplyA, exchange(kA));
    EXPECT_THAT(reports, ElementsAre(HasSubstr("--min-gap")));
}

TEST_F(LineExchangeTest, LateReplyIsThrownAwayAndTheWaitGoesOn) {
    arrive(5, kReplyA);
    ASSERT_EQ(kReplyA, exchange(kA));
    ASSERT_EQ(Bytes{}, exchange(kB));
    const int sent = line.elapsedMs();
    arrive(sent + 20, kReplyB);
    arrive(sent + 40, kLongReply);
    EXPECT_EQ(kLongReply, exchange(kLong));
    EXPECT_THAT(thrownAway, ElementsAre(kReplyB));
    EXPECT_EQ(1u, port().counts()->late);
}

TEST_F(LineExchangeTest, RequestWaitsForTheLateReplyThatLooksLikeItsOwn) {
    arrive(5, kReplyA);
    ASSERT_EQ(kReplyA, exchange(kA));
    ASSERT_EQ(Bytes{}, exchange(kB));
    const int sent = line.elapsedMs();
    arrive(sent + 50, kReplyB);
    arrive(sent + 90, kReplyA);
    EXPECT_EQ(kReplyA, exchange(kA));
    EXPECT_EQ(1u, port().counts()->late);
    EXPECT_THAT(reports, ElementsAre(HasSubstr("set the timeout to")));
}

TEST_F(LineExchangeTest, TwoRepliesWithoutAPauseAreToldApart) {
    arrive(5, kReplyA);
    ASSERT_EQ(kReplyA, exchange(kA));
    ASSERT_EQ(Bytes{}, exchange(kB));
    Bytes both = kReplyB;
    both.insert(both.end(), kLongReply.begin(), kLongReply.end());
    arrive(line.elapsedMs() + 20, both);
    EXPECT_EQ(kLongReply, exchange(kLong));
}

TEST_F(LineExchangeTest, WithoutRulesALateReplyIsTakenAsItComes) {
    options.rules = nullptr;
    ASSERT_EQ(Bytes{}, exchange(kA));
    arrive(line.elapsedMs() + 20, kReplyA);
    EXPECT_EQ(kReplyA, exchange(kB));
}

TEST_F(LineExchangeTest, NodeThatNeverStopsAnsweringIsRefusedInBoundedTime) {
    for (int at = 5; at < 60'000; at += 50)
        arrive(at, kReplyA);
    ASSERT_EQ(kReplyA, exchange(kA));
    wait(line.elapsedMs() + 60);
    const int begun = line.elapsedMs();
    EXPECT_EQ(Bytes{}, exchange(kB));
    EXPECT_LE(line.elapsedMs(), begun + 6000);
    const int refused = line.elapsedMs();
    EXPECT_EQ(Bytes{}, receive());
    EXPECT_EQ(refused, line.elapsedMs());
    // The repetitions do not wait once more.
    EXPECT_EQ(Bytes{}, exchange(kB));
    EXPECT_LE(line.elapsedMs(), refused + 100);
}

TEST_F(LineExchangeTest, BytesWithoutEndAreBounded) {
    line.drip(1);
    EXPECT_FALSE(exchange(kA).empty());
    EXPECT_LE(line.elapsedMs(), 250);
    const int begun = line.elapsedMs();
    EXPECT_FALSE(exchange(kB).empty());
    EXPECT_LE(line.elapsedMs(), begun + 7000);
}

TEST_F(LineExchangeTest, LineThatVanishesEndsEveryStepAtOnce) {
    for (const int goneAt : {0, 2, 25, 60}) {
        SCOPED_TRACE(goneAt);
        FakeLine dying;
        LineExchange steps(dying, options);
        steps.setFormat(10000, 10);
        dying.arrive(20, {1, 2});
        dying.vanish(goneAt);
        std::uint8_t byte = 0;
        std::array<std::uint8_t, 16> rest{};
        steps.receiveByte(byte, 0ms);
        steps.clearToSend(kA);
        steps.transmit(kA, true);
        if (steps.receiveByte(byte, 1000ms) == Transfer::Complete) {
            EXPECT_EQ(goneAt < 34 ? Transfer::Gone : Transfer::Complete,
                      steps.receiveFrame(rest, 1000ms, kGap).how);
        }
        EXPECT_LE(dying.elapsedMs(), 34);
    }
}

TEST_F(LineExchangeTest, LineThatVanishesDuringTheWaitEndsIt) {
    arrive(5, kReplyA);
    ASSERT_EQ(kReplyA, exchange(kA));
    ASSERT_EQ(Bytes{}, exchange(kB));
    line.vanish(line.elapsedMs() + 7);
    const int begun = line.elapsedMs();
    EXPECT_FALSE(send(kA));
    EXPECT_EQ(begun + 7, line.elapsedMs());
}

TEST_F(LineExchangeTest, NewSettingsThrowAwayWhatHasBeenReceived) {
    arrive(0, {1, 2, 3});
    std::uint8_t byte = 0;
    ASSERT_EQ(Transfer::Complete, port().receiveByte(byte, kTimeout));
    port().forgetInput();
    EXPECT_EQ(Transfer::TimedOut, port().receiveByte(byte, 0ms));
}

TEST_F(LineExchangeTest, PurgeThrowsAwayWhatHasBeenReceived) {
    arrive(0, {1, 2, 3});
    std::uint8_t byte = 0;
    ASSERT_EQ(Transfer::Complete, port().receiveByte(byte, kTimeout));
    port().purge();
    EXPECT_EQ(Transfer::TimedOut, port().receiveByte(byte, 0ms));
}

}  // namespace
