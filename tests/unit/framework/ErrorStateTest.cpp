// The last failure of a protocol: what stays readable, and for how long.
#include "framework/ErrorState.h"

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "tests/support/MemoryShortage.h"

namespace {

using testing_support::MemoryShortage;

std::string numbered(const char* text, int number) {
    return text + std::to_string(number);
}

bool quote(ErrorState& state, const std::string& quoted) {
    const std::string_view parts[] = {"refused: ", quoted};
    return state.setQuoting(-1, parts);
}

void expectLast(const ErrorState& state, int code, const std::string& text) {
    EXPECT_EQ(code, state.last().code);
    EXPECT_EQ(text, state.last().text);
}

TEST(ErrorStateTest, StartsWithCodeOneAndNoText) {
    const ErrorState state;
    expectLast(state, 1, "");
}

TEST(ErrorStateTest, LastFailureIsTheOneInForceAlsoWhenItCameBefore) {
    ErrorState state;
    state.set(-4, "No response");
    state.set(-6, "Incorrect response checksum");
    state.set(-4, "No response");
    expectLast(state, -4, "No response");
}

TEST(ErrorStateTest, SameTextUnderTwoCodesAreTwoFailures) {
    ErrorState state;
    state.set(-4, "text");
    state.set(-6, "text");
    expectLast(state, -6, "text");
}

TEST(ErrorStateTest, TextHandedOutStaysWhateverFailsAfterwards) {
    ErrorState state;
    state.set(-4, "No response");
    const char* handedOut = state.last().text;
    for (int number = 0; number < 1000; ++number) {
        state.set(-6, numbered("failure ", number));
        quote(state, numbered("tag ", number));
    }
    EXPECT_STREQ("No response", handedOut);
}

TEST(ErrorStateTest, RepeatedFailureGivesTheSameText) {
    ErrorState state;
    state.set(-4, "No response");
    const char* first = state.last().text;
    quote(state, "a tag");
    state.set(-4, "No response");
    EXPECT_EQ(first, state.last().text);
}

TEST(ErrorStateTest, QuotingTextStaysForEightMoreOfItsKind) {
    ErrorState state;
    quote(state, "the first");
    const char* handedOut = state.last().text;
    for (int number = 0; number < 7; ++number)
        quote(state, numbered("another ", number));
    quote(state, "another 3");  // Known, and so no further one.
    EXPECT_STREQ("refused: the first", handedOut);
}

TEST(ErrorStateTest, QuotingTextReportedAgainTakesItsTurnAnew) {
    ErrorState state;
    quote(state, "the first");
    for (int number = 0; number < 7; ++number)
        quote(state, numbered("another ", number));
    quote(state, "the first");
    const char* handedOut = state.last().text;
    for (int number = 7; number < 14; ++number)
        quote(state, numbered("another ", number));
    EXPECT_STREQ("refused: the first", handedOut);
}

TEST(ErrorStateTest, FailureLikeTheStateAtTheStartKeepsItsPlace) {
    ErrorState state;
    state.set(1, "");
    const ErrorState::Failure& reported = state.last();
    for (int number = 0; number < 8; ++number)
        quote(state, numbered("another ", number));
    EXPECT_EQ(1, reported.code);
    EXPECT_STREQ("", reported.text);
}

TEST(ErrorStateTest, QuotingTextsTakeNoPlaceFromTheLastingOnes) {
    ErrorState state;
    for (int number = 0; number < 1000; ++number)
        quote(state, numbered("tag ", number));
    state.set(-4, "No response");
    const char* handedOut = state.last().text;
    for (int number = 0; number < 20; ++number)
        quote(state, numbered("another tag ", number));
    EXPECT_STREQ("No response", handedOut);
}

TEST(ErrorStateTest, MoreFailuresThanThereIsRoomForAreStillReportedExactly) {
    ErrorState state;
    for (int number = 0; number < 500; ++number) {
        const std::string text = numbered("a failure of some length, number ", number);
        state.set(-number, text);
        expectLast(state, -number, text);
    }
}

TEST(ErrorStateTest, TextsOfAnyLengthAreExactAndStayReadable) {
    ErrorState state;
    std::vector<const char*> handedOut;
    for (std::size_t length = 0; length < 40000; length = length * 3 / 2 + 1) {
        const std::string text(length, 'x');
        state.set(-1, text);
        expectLast(state, -1, text);
        EXPECT_TRUE(quote(state, text));
        expectLast(state, -1, "refused: " + text);
        handedOut.push_back(state.last().text);
    }
    // Old texts may have become newer ones; what matters is that there is a text to read.
    for (const char* text : handedOut)
        EXPECT_LT(std::string(text).size(), 60000U);
}

TEST(ErrorStateTest, TextsOf256CharactersNeedNoMemory) {
    ErrorState state;
    const std::string text(256, 'x');
    const std::string quoted(256 - 9, 'q');
    {
        const MemoryShortage shortage;
        state.set(-6, text);
        expectLast(state, -6, text);
        EXPECT_TRUE(quote(state, quoted));
    }
    expectLast(state, -1, "refused: " + quoted);
}

TEST(ErrorStateTest, WithoutMemoryALongTextIsCutAndALongQuotationRefused) {
    ErrorState state;
    const std::string text(5000, 'x');
    bool done = true;
    {
        const MemoryShortage shortage;
        state.set(-6, text);
        done = quote(state, text);
    }
    EXPECT_FALSE(done);
    expectLast(state, -6, text.substr(0, 256));
}

/// Each failure is a code and the code's own text; readers look at both through one look.
TEST(ErrorStateTest, NoReaderSeesAFailureInTheMaking) {
    ErrorState state;
    std::atomic<bool> done = false;
    std::atomic<int> torn = 0;
    std::vector<std::thread> threads;
    for (int writer = 0; writer < 4; ++writer)
        threads.emplace_back([&state, writer] {
            for (int round = 0; round < 2000; ++round) {
                const int code = writer * 10 + round % 10;
                state.set(code, numbered("code ", code));
            }
        });
    for (int reader = 0; reader < 2; ++reader)
        threads.emplace_back([&state, &done, &torn] {
            while (!done) {
                const ErrorState::Failure& last = state.last();
                if (last.code != 1 && numbered("code ", last.code) != last.text) ++torn;
            }
        });
    for (std::size_t writer = 0; writer < 4; ++writer)
        threads[writer].join();
    done = true;
    threads[4].join();
    threads[5].join();
    EXPECT_EQ(0, torn);
}

}  // namespace
