#include <gtest/gtest.h>

#include <tuple>

#include "tests/unit/wire/Exchanges.h"

namespace wire {
namespace {

Answering answering(Mode mode, const Bytes& request, const Bytes& reply) {
    return answering(requestOf(mode, request), encodeFrame(mode, reply));
}

TEST(RepliesTest, EveryFunctionsReplyAnswersAndIsWhole) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            const Bytes frame = encodeFrame(mode, reply);
            EXPECT_EQ(Answering::Yes, answering(asked, frame)) << nameOf(mode, request);
            EXPECT_TRUE(isWholeReply(asked, frame)) << nameOf(mode, request);
            EXPECT_EQ(frame.size(), replyLength(asked, frame)) << nameOf(mode, request);
        }
    }
}

TEST(RepliesTest, EveryFunctionsExceptionAnswersAndIsWhole) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            const Bytes frame = encodeFrame(mode, exceptionOf(request));
            EXPECT_EQ(Answering::Yes, answering(asked, frame)) << nameOf(mode, request);
            EXPECT_TRUE(isWholeReply(asked, frame)) << nameOf(mode, request);
            EXPECT_EQ(frame.size(), replyLength(asked, frame)) << nameOf(mode, request);
        }
    }
}

TEST(RepliesTest, NoPrefixOfAReplyIsWholeOrAnswers) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            for (const Bytes& message : {reply, exceptionOf(request)}) {
                const Bytes frame = encodeFrame(mode, message);
                for (std::size_t count = 0; count < frame.size(); ++count) {
                    const ByteView prefix = ByteView(frame).first(count);
                    EXPECT_FALSE(isWholeReply(asked, prefix)) << nameOf(mode, request) << count;
                    EXPECT_NE(Answering::Yes, answering(asked, prefix))
                        << nameOf(mode, request) << count;
                }
            }
        }
    }
}

TEST(RepliesTest, AnotherNodeFunctionOrCountDoesNotAnswer) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const auto name = nameOf(mode, request);
            EXPECT_EQ(Answering::No, answering(mode, request, with(reply, 0, 2))) << name;
            EXPECT_EQ(Answering::No, answering(mode, request, with(reply, 1, 7))) << name;
            EXPECT_EQ(Answering::No, answering(mode, request, with(reply, 2, 99))) << name;
            const Bytes exception = exceptionOf(request);
            EXPECT_EQ(Answering::No, answering(mode, request, with(exception, 0, 2))) << name;
            EXPECT_EQ(Answering::No, answering(mode, request, with(exception, 1, 0x87))) << name;
        }
    }
}

TEST(RepliesTest, AByteTooManyOrTooFewDoesNotAnswer) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            Bytes shorter = reply;
            shorter.pop_back();
            EXPECT_EQ(Answering::No, answering(mode, request, shorter)) << nameOf(mode, request);
            Bytes longer = reply;
            longer.push_back(0);
            EXPECT_EQ(Answering::No, answering(mode, request, longer)) << nameOf(mode, request);
            Bytes exception = exceptionOf(request);
            exception.push_back(0);
            EXPECT_EQ(Answering::No, answering(mode, request, exception)) << nameOf(mode, request);
        }
    }
}

TEST(RepliesTest, EveryByteThatAWriteRepeatsMustAgree) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            if (isRead(functionRow(request[1])->form)) continue;
            for (std::size_t at = 2; at < reply.size(); ++at) {
                const auto other = static_cast<std::uint8_t>(reply[at] ^ 1U);
                EXPECT_EQ(Answering::No, answering(mode, request, with(reply, at, other)))
                    << nameOf(mode, request) << at;
            }
        }
    }
}

TEST(RepliesTest, AWrongCheckIsDamageWhereTheLengthIsRight) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            const Bytes spoilt = encodeFrame(mode, reply, true);
            EXPECT_EQ(Answering::Damaged, answering(asked, spoilt)) << nameOf(mode, request);
            if (mode == Mode::Rtu) {
                EXPECT_FALSE(isWholeReply(asked, spoilt)) << nameOf(mode, request);
            }
            Bytes longer = reply;
            longer.push_back(0);
            EXPECT_EQ(Answering::No, answering(asked, encodeFrame(mode, longer, true)));
            EXPECT_EQ(Answering::No,
                      answering(asked, encodeFrame(mode, exceptionOf(request), true)));
        }
    }
    EXPECT_EQ(Answering::No, answering(requestOf(Mode::Rtu, kRead), {}));
}

TEST(RepliesTest, AsciiIsDamagedByLowerCaseAndOtherCharacters) {
    const Request asked = requestOf(Mode::Ascii, kRead);
    const Bytes good = encodeFrame(Mode::Ascii, kReadReply);
    ASSERT_EQ('B', good[10]);
    EXPECT_EQ(Answering::Damaged, answering(asked, with(good, 10, 'b')));
    EXPECT_EQ(Answering::Damaged, answering(asked, with(good, 10, ' ')));
    EXPECT_EQ(Answering::Damaged, answering(asked, with(good, 0, ';')));
    Bytes oddDigits = good;
    oddDigits.erase(oddDigits.begin() + 5);
    EXPECT_EQ(Answering::No, answering(asked, oddDigits));
    Bytes withoutCr = good;
    withoutCr.erase(withoutCr.end() - 2);
    EXPECT_EQ(Answering::No, answering(asked, withoutCr));
    EXPECT_FALSE(isWholeReply(asked, withoutCr));
}

TEST(RepliesTest, AsciiIsWholeFromColonToCrLfWhateverItSays) {
    const Request asked = requestOf(Mode::Ascii, kRead);
    EXPECT_TRUE(isWholeReply(asked, Bytes{':', 'x', '\r', '\n'}));
    EXPECT_TRUE(isWholeReply(asked, Bytes{':', '\r', '\n'}));
    EXPECT_FALSE(isWholeReply(asked, Bytes{'\r', '\n'}));
    EXPECT_FALSE(isWholeReply(asked, Bytes{'0', ':', '\r', '\n'}));
    EXPECT_FALSE(isWholeReply(asked, Bytes{':', '\n', '\r'}));
}

// Why a line that echoes must end its frames by silence.
TEST(RepliesTest, TheEchoOfARequestCanBeginWithItsReply) {
    const Bytes echo = *fromHex(
        Bytes{'0', '4', '0', '3', '0', '2', 'B', '0', '0', '0', '0', '1', '8', '4', '0', '0'});
    const Request asked = requestIn(echo).value();
    const ByteView reply = ByteView(echo).first(7);
    EXPECT_TRUE(isWholeReply(asked, reply));
    EXPECT_EQ(Answering::Yes, answering(asked, reply));
    EXPECT_FALSE(isWholeReply(asked, echo));
}

TEST(RepliesTest, ARegisterHasTwoBytesOrFour) {
    EXPECT_EQ(Answering::Yes, answering(Mode::Rtu, {1, 3, 0, 0, 0, 1}, {1, 3, 2, 0, 0}));
    EXPECT_EQ(Answering::Yes, answering(Mode::Rtu, {1, 3, 0, 0, 0, 1}, {1, 3, 4, 0, 0, 0, 0}));
    EXPECT_EQ(Answering::No, answering(Mode::Rtu, {1, 3, 0, 0, 0, 1}, {1, 3, 3, 0, 0, 0}));
    EXPECT_EQ(Answering::No, answering(Mode::Rtu, {1, 4, 0, 0, 0, 1}, {1, 4, 4, 0, 0, 0, 0}));
}

TEST(RepliesTest, WhatNoByteCountCanSayIsAnsweredByAnExceptionOnly) {
    const Bytes tooMany{1, 3, 0, 0, 0, 128};
    Bytes reply{1, 3, 0};
    reply.resize(3 + 256);
    EXPECT_EQ(Answering::No, answering(Mode::Rtu, tooMany, {1, 3, 0}));
    EXPECT_EQ(Answering::No, answering(Mode::Rtu, tooMany, reply));
    EXPECT_EQ(Answering::Yes, answering(Mode::Rtu, tooMany, exceptionOf(tooMany)));
    EXPECT_EQ(0U, replyLength(requestOf(Mode::Rtu, tooMany), Bytes{1, 3}));
    EXPECT_EQ(0U, replyLength(requestOf(Mode::Rtu, {1, 3, 0, 0, 0x80, 0}), Bytes{1, 3, 0}));
}

TEST(RepliesTest, LongestRepliesAreWhole) {
    for (const auto& [function, count, values] :
         {std::tuple{3, 125, 250}, {4, 125, 250}, {3, 62, 248}, {1, 2000, 250}, {2, 1999, 250}}) {
        const auto code = static_cast<std::uint8_t>(function);
        Bytes reply{1, code, static_cast<std::uint8_t>(values)};
        reply.resize(reply.size() + static_cast<std::size_t>(values));
        const Bytes request{1,
                            code,
                            0,
                            0,
                            static_cast<std::uint8_t>(count / 256),
                            static_cast<std::uint8_t>(count % 256)};
        for (const Mode mode : kModes)
            EXPECT_TRUE(isWholeReply(requestOf(mode, request), encodeFrame(mode, reply)))
                << nameOf(mode, request);
    }
}

TEST(RepliesTest, ARequestIsAsciiWhenAllItsPartsAre) {
    EXPECT_EQ(Mode::Ascii, requestOf(Mode::Ascii, kRead).mode);
    // RTU to node 58, function 65, with a CRC of 0D 0A.
    for (std::uint32_t data = 0; data <= 0xFFFF; ++data) {
        const Bytes frame =
            encodeFrame(Mode::Rtu, Bytes{':', 'A', static_cast<std::uint8_t>(data >> 8U),
                                         static_cast<std::uint8_t>(data & 0xFFU)});
        const auto request = requestIn(frame);
        ASSERT_TRUE(request) << data;
        EXPECT_EQ(Mode::Rtu, request->mode) << data;
        EXPECT_EQ(58, request->node);
    }
}

TEST(RepliesTest, DamagedBytesAreNoRequest) {
    for (const Mode mode : kModes) {
        EXPECT_FALSE(requestIn(encodeFrame(mode, kRead, true)));
        EXPECT_FALSE(requestIn(ByteView(encodeFrame(mode, kRead)).first(4)));
    }
    EXPECT_FALSE(requestIn({}));
    EXPECT_FALSE(requestIn(Bytes(300, 0)));
}

TEST(RepliesTest, NobodyAnswersABroadcast) {
    const Bytes broadcast{0, 6, 0, 1, 0, 3};
    for (const Mode mode : kModes) {
        const Request request = requestOf(mode, broadcast);
        const Bytes echo = encodeFrame(mode, broadcast);
        EXPECT_TRUE(request.isBroadcast());
        EXPECT_EQ(0U, replyLength(request, {}));
        EXPECT_FALSE(isWholeReply(request, echo));
        EXPECT_EQ(Answering::No, answering(request, echo));
        EXPECT_FALSE(confusable(request, request));
    }
}

TEST(RepliesTest, OfOtherFunctionsNodeFunctionAndCheckDecide) {
    const Bytes request{1, 43, 14, 1, 0};
    for (const Mode mode : kModes) {
        const Request asked = requestOf(mode, request);
        const Bytes reply = encodeFrame(mode, Bytes{1, 43, 14, 1, 2, 3, 4});
        EXPECT_EQ(0U, replyLength(asked, {}));
        EXPECT_EQ(mode == Mode::Ascii, isWholeReply(asked, reply));
        EXPECT_EQ(Answering::Yes, answering(asked, reply));
        EXPECT_EQ(Answering::Yes, answering(mode, request, {1, 43 | 0x80, 1}));
        EXPECT_EQ(Answering::No, answering(mode, request, {1, 43 | 0x80, 1, 1}));
        EXPECT_EQ(Answering::No, answering(mode, request, {2, 43, 14}));
        EXPECT_EQ(Answering::No, answering(mode, request, {1, 44, 14}));
        EXPECT_EQ(Answering::No, answering(asked, encodeFrame(mode, Bytes{1, 43, 14}, true)));
    }
}

TEST(RepliesTest, ARequestLaidOutOtherwiseIsLikeAnotherFunction) {
    for (const Bytes& request : {Bytes{1, 3}, Bytes{1, 3, 0, 0, 0}, Bytes{1, 3, 0, 0, 0, 1, 0},
                                 Bytes{1, 5, 0, 0, 0, 1, 0, 0}, Bytes{1, 16, 0, 0, 0, 1}}) {
        const Request asked = requestOf(Mode::Rtu, request);
        EXPECT_EQ(nullptr, asked.row) << hexText(request);
        EXPECT_EQ(0U, replyLength(asked, {})) << hexText(request);
        EXPECT_EQ(Answering::Yes, answering(Mode::Rtu, request, exceptionOf(request)));
    }
}

TEST(RepliesTest, AKnownRequestSaysTheSameWithoutItsCrc) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            Bytes frame = encodeFrame(mode, request);
            const Request asked = requestIn(frame).value();
            if (mode == Mode::Rtu) frame.back() ^= 0xFFU;
            const auto known = knownRequestIn(frame);
            ASSERT_TRUE(known) << nameOf(mode, request);
            EXPECT_EQ(std::tie(asked.mode, asked.node, asked.function, asked.row, asked.fields,
                               asked.fieldCount),
                      std::tie(known->mode, known->node, known->function, known->row, known->fields,
                               known->fieldCount))
                << nameOf(mode, request);
        }
    }
    EXPECT_FALSE(knownRequestIn({}));
    EXPECT_FALSE(knownRequestIn(Bytes(3, 0)));
}

}  // namespace
}  // namespace wire
