#include "runtime/OwedReplies.h"

#include <gtest/gtest.h>

#include "tests/unit/runtime/FakeRules.h"

namespace {

using namespace runtime;
using namespace std::chrono_literals;
using Kind = Departure::Kind;
using Verdict = OwedReplies::Verdict;
using Bytes = FakeRules::Bytes;

constexpr auto kTimeout = 100ms;

/// Two registers of node 1 whose replies look alike, one that is longer, one of another node.
const Bytes kA = FakeRules::request(1, 2, 'a');
const Bytes kB = FakeRules::request(1, 2, 'b');
const Bytes kLong = FakeRules::request(1, 4, 'l');
const Bytes kOther = FakeRules::request(2, 2, 'o');
const Bytes kReply = FakeRules::reply(1, 2);
const Bytes kLongReply = FakeRules::reply(1, 4);

struct OwedRepliesTest : ::testing::Test {
    Line::TimePoint at(std::chrono::milliseconds time) const { return start + time; }
    void send(const Bytes& request, std::chrono::milliseconds time) {
        book.sent(request, at(time));
        book.awaits(kTimeout);
    }
    Kind before(const Bytes& request, std::chrono::milliseconds time) {
        return book.before(request, at(time)).kind;
    }
    Verdict arrive(const Bytes& frame, std::chrono::milliseconds time) {
        return book.arrived(frame, at(time));
    }
    /// The node is there and answers after 10 ms.
    void nodeAnswers(std::chrono::milliseconds time) {
        send(kLong, time);
        ASSERT_EQ(Verdict::Deliver, arrive(kLongReply, time + 10ms));
    }

    const Line::TimePoint start = Line::TimePoint{} + std::chrono::hours{1};
    FakeRules rules;
    OwedReplies book{rules};
};

TEST_F(OwedRepliesTest, AnsweredRequestLeavesNothingOwed) {
    nodeAnswers(0ms);
    EXPECT_FALSE(book.mustSeeWhole());
    EXPECT_EQ(Kind::Now, before(kLong, 11ms));
}

TEST_F(OwedRepliesTest, RepetitionNeverWaitsAndTakesTheReplyToAnyAttempt) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    EXPECT_EQ(Kind::Now, before(kA, 120ms));
    send(kA, 120ms);
    EXPECT_EQ(Verdict::Deliver, arrive(kReply, 140ms));
}

TEST_F(OwedRepliesTest, RequestWaitsForTheReplyThatLooksLikeItsOwn) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kA, 120ms);
    arrive(kReply, 140ms);
    EXPECT_EQ(Kind::Later, before(kB, 141ms));
    book.arrivedLate(kReply, at(240ms));
    EXPECT_EQ(1u, book.counts().late);
    EXPECT_EQ(Kind::Now, before(kB, 241ms));
}

TEST_F(OwedRepliesTest, WaitEndsAfterTwiceTheTimeoutOfSilence) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kA, 120ms);
    arrive(kReply, 130ms);
    // 110 ms after its first attempt, if it is the reply to that.
    EXPECT_EQ(at(130ms + 2 * 110ms), book.before(kB, at(131ms)).when);
    EXPECT_EQ(Kind::Now, before(kB, 350ms));
    EXPECT_EQ(1u, book.counts().forgotten);
}

TEST_F(OwedRepliesTest, WhatWasSuspectedStaysSuspectedWithoutProof) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kA, 120ms);
    arrive(kReply, 130ms);
    ASSERT_EQ(Kind::Now, before(kB, 350ms));
    send(kB, 350ms);
    EXPECT_EQ(at(350ms + 2 * 110ms), book.before(kA, at(450ms)).when);
}

TEST_F(OwedRepliesTest, NodeThatReturnsIsNotTakenForAsSlowAsItWasDead) {
    send(kA, 0ms);
    send(kB, 1'000ms);
    arrive(kReply, 1'010ms);
    ASSERT_EQ(Kind::Now, before(kB, 1'010ms + 2 * 1'010ms));
    send(kB, 3'100ms);
    EXPECT_EQ(at(3'100ms + 2 * kTimeout), book.before(kA, at(3'200ms)).when);
}

TEST_F(OwedRepliesTest, SlowNodeIsWaitedForTwiceItsLargestTurnaround) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    ASSERT_EQ(Kind::Later, before(kB, 120ms));
    book.arrivedLate(kReply, at(320ms));
    send(kB, 330ms);
    EXPECT_EQ(at(330ms + 2 * 300ms), book.before(kA, at(430ms)).when);
}

TEST_F(OwedRepliesTest, RequestThatCannotBeMistakenDoesNotWait) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    EXPECT_EQ(Kind::Now, before(kLong, 120ms));
    EXPECT_EQ(Kind::Now, before(kOther, 120ms));
}

TEST_F(OwedRepliesTest, LateReplyOfAnotherLengthIsThrownAway) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kLong, 120ms);
    EXPECT_TRUE(book.mustSeeWhole());
    EXPECT_EQ(Verdict::ThrowAway, arrive(kReply, 130ms));
    EXPECT_EQ(Verdict::Deliver, arrive(kLongReply, 135ms));
    EXPECT_FALSE(book.mustSeeWhole());
}

TEST_F(OwedRepliesTest, EarlierRequestOfTheSameRegisterIsAnotherRequest) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kLong, 120ms);
    arrive(kLongReply, 130ms);
    EXPECT_EQ(Kind::Later, before(kA, 131ms));
}

TEST_F(OwedRepliesTest, NodeThatWasNeverHeardIsNotWaitedFor) {
    send(kA, 0ms);
    EXPECT_EQ(Kind::Now, before(kB, 100ms));
}

TEST_F(OwedRepliesTest, FirstReplyOfANodeThatMayBeToAnOlderRequestIsThrownAway) {
    send(kA, 0ms);
    send(kB, 100ms);
    EXPECT_EQ(Verdict::ThrowAway, arrive(kReply, 150ms));
}

TEST_F(OwedRepliesTest, NodeThatReturnsIsRefusedUntilItIsSilent) {
    send(kA, 0ms);
    send(kB, 100ms);
    arrive(kReply, 150ms);
    EXPECT_EQ(Kind::Not, before(kB, 200ms));
    EXPECT_EQ(Kind::Not, before(kA, 200ms));
    EXPECT_EQ(at(200ms + kTimeout), book.before(kA, at(200ms)).when);
    EXPECT_EQ(Kind::Now, before(kLong, 200ms));
    EXPECT_EQ(Kind::Now, before(kB, 150ms + 2 * 150ms));
    send(kB, 450ms);
    EXPECT_EQ(Verdict::Deliver, arrive(kReply, 460ms));
}

TEST_F(OwedRepliesTest, NodeThatHasDiedIsWaitedForOnce) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    ASSERT_EQ(Kind::Later, before(kB, 120ms));
    ASSERT_EQ(Kind::Now, before(kB, 220ms));
    send(kB, 220ms);
    EXPECT_EQ(Kind::Now, before(kA, 320ms));
}

TEST_F(OwedRepliesTest, NodeThatHasDiedIsWaitedForNoMoreAlsoWhenOthersTookTheTime) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kOther, 120ms);
    ASSERT_EQ(Kind::Now, before(kB, 250ms));
    send(kB, 250ms);
    EXPECT_EQ(Kind::Now, before(kA, 350ms));
}

TEST_F(OwedRepliesTest, NodeThatComesBackIsWaitedForAgain) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    before(kB, 220ms);
    send(kB, 220ms);
    ASSERT_EQ(Verdict::Deliver, arrive(kReply, 230ms));
    send(kA, 240ms);
    EXPECT_EQ(Kind::Later, before(kB, 340ms));
}

TEST_F(OwedRepliesTest, ReplyTenSecondsLateIsStillKnownFromANodeNeverHeard) {
    send(kA, 0ms);
    send(kLong, 9'900ms);
    book.before(kLong, at(9'950ms));
    EXPECT_EQ(Verdict::ThrowAway, arrive(kReply, 10'000ms));
}

TEST_F(OwedRepliesTest, RequestToANodeNeverHeardIsForgottenInTheEnd) {
    send(kA, 0ms);
    send(kOther, 100ms);
    book.before(kOther, at(15'001ms));
    EXPECT_FALSE(book.mustSeeWhole());
    EXPECT_EQ(1u, book.counts().forgotten);
}

TEST_F(OwedRepliesTest, SpoiltReplyIsAReplyThatCame) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    EXPECT_EQ(Verdict::Deliver, arrive(FakeRules::reply(1, 2, FakeRules::kSpoilt), 30ms));
    EXPECT_EQ(Kind::Now, before(kB, 31ms));
}

TEST_F(OwedRepliesTest, NodeThatAnswersTwiceIsWaitedForAfterEveryReply) {
    nodeAnswers(0ms);
    book.arrivedLate(kLongReply, at(15ms));
    EXPECT_EQ(1u, book.counts().surplus);
    EXPECT_EQ(Kind::Later, before(kA, 16ms));
    EXPECT_EQ(Kind::Now, before(kA, 15ms + 2 * kTimeout));
}

TEST_F(OwedRepliesTest, NodeWhoseRepliesComeTogetherIsWaitedForBeforeARepetitionToo) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    Bytes both = kLongReply;
    both.insert(both.end(), kReply.begin(), kReply.end());
    EXPECT_EQ(Verdict::Deliver, arrive(both, 30ms));
    EXPECT_EQ(1u, book.counts().surplus);
    EXPECT_EQ(Kind::Later, before(kA, 31ms));
    EXPECT_EQ(Kind::Now, before(kA, 30ms + 2 * kTimeout));
}

TEST_F(OwedRepliesTest, NodeThatAnsweredTwiceIsTrustedAfterManySilences) {
    nodeAnswers(0ms);
    book.arrivedLate(kLongReply, at(15ms));
    auto now = 20ms;
    for (unsigned i = 0; i < OwedReplies::kSilencesOfTrust; ++i) {
        EXPECT_EQ(Kind::Later, before(kA, now));
        ASSERT_EQ(Kind::Now, before(kA, now + 3 * kTimeout));
        now += 3 * kTimeout;
        send(kA, now);
        ASSERT_EQ(Verdict::Deliver, arrive(kReply, now + 10ms));
        now += 20ms;
    }
    EXPECT_EQ(Kind::Now, before(kA, now));
}

TEST_F(OwedRepliesTest, BroadcastOwesNothing) {
    nodeAnswers(0ms);
    send(FakeRules::request(0, 2, 'x'), 20ms);
    EXPECT_EQ(Kind::Now, before(kA, 21ms));
    EXPECT_FALSE(book.mustSeeWhole());
}

TEST_F(OwedRepliesTest, FrameOfNobodyIsDelivered) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kLong, 120ms);
    EXPECT_EQ(Verdict::Deliver, arrive({9, 9, 9}, 130ms));
}

TEST_F(OwedRepliesTest, FramesWithoutAPauseAreToldApart) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    send(kLong, 120ms);
    Bytes both = kReply;
    both.insert(both.end(), kLongReply.begin(), kLongReply.end());
    EXPECT_EQ(kReply.size(), book.frontFrame(both));
    EXPECT_EQ(kLongReply.size(), book.frontFrame(kLongReply));
    EXPECT_EQ(0u, book.frontFrame(Bytes{9, 9, 9}));
}

TEST_F(OwedRepliesTest, LateNodeIsToldOnceWithItsTurnaround) {
    nodeAnswers(0ms);
    send(kA, 20ms);
    ASSERT_FALSE(book.takeLateNode());
    book.arrivedLate(kReply, at(270ms));
    const auto late = book.takeLateNode();
    ASSERT_TRUE(late);
    EXPECT_EQ(1, late->node);
    EXPECT_EQ(250ms, late->turnaround);
    EXPECT_EQ(100ms, late->timeout);
    send(kA, 300ms);
    book.arrivedLate(kReply, at(600ms));
    EXPECT_FALSE(book.takeLateNode());
}

TEST_F(OwedRepliesTest, NodeThatComesBackIsNotCalledLate) {
    send(kA, 0ms);
    send(kB, 9'000ms);
    arrive(kReply, 9'010ms);
    before(kB, 60'000ms);
    EXPECT_FALSE(book.takeLateNode());
}

TEST_F(OwedRepliesTest, OldestOfTooManyUnansweredRequestsIsForgotten) {
    for (std::size_t i = 0; i <= OwedReplies::kMostRequests + 1; ++i) {
        send(FakeRules::request(1, 2, static_cast<std::uint8_t>(i)), std::chrono::milliseconds(i));
    }
    EXPECT_EQ(1u, book.counts().overflown);
}

}  // namespace
