#include "poll/Failure.h"

#include <gtest/gtest.h>

#include "mrtu/Reply.h"

namespace poll {
namespace {

struct Case {
    ReadError error;
    FailureKind kind;
    bool heard;
    bool againstNode;
};

TEST(ReadFailureTest, EveryErrorHasItsMeaning) {
    const Case cases[] = {
        {{0, ""}, FailureKind::None, true, false},
        {{-4, "No response"}, FailureKind::Timeout, false, true},
        {{-6, "Incorrect response checksum"}, FailureKind::Check, false, true},
        {{-6, "The received message too short"}, FailureKind::Check, false, true},
        {{-6, "Exception: Illegal function"}, FailureKind::Refusal, true, false},
        {{-6, "Exception: Illegal data address"}, FailureKind::Refusal, true, false},
        {{-6, "Exception: Illegal data value"}, FailureKind::Refusal, true, false},
        {{-6, "Exception: Failure in device"}, FailureKind::Exception, true, false},
        {{-6, "Unknown exception"}, FailureKind::Exception, true, false},
        {{-6, "Exception: gateway: timeout from target"}, FailureKind::Unreached, false, true},
        {{-9, "Conversion"}, FailureKind::Value, true, false},
        {{-10, "Node disabled"}, FailureKind::NotSent, false, false},
        {{-1, "Can't open serial port"}, FailureKind::NotSent, false, false},
    };
    for (const Case& one : cases) {
        const Failure failure = classify(one.error);
        EXPECT_EQ(one.kind, failure.kind) << one.error.text;
        EXPECT_EQ(one.heard, failure.heard()) << one.error.text;
        EXPECT_EQ(one.againstNode, failure.againstNode()) << one.error.text;
    }
}

TEST(ReadFailureTest, TheDriversTextsAreTheOnesThatAreKnown) {
    for (int code = 0; code < 256; ++code) {
        const auto byte = static_cast<std::uint8_t>(code);
        const std::string text = getExceptionText(byte);
        const Failure failure = classify({-6, text});
        EXPECT_NE(FailureKind::Check, failure.kind) << code;
        EXPECT_EQ(text == "Unknown exception" ? 0 : byte, failure.exception) << code;
    }
}

}  // namespace
}  // namespace poll
