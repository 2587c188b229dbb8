// Golden frames: Modbus Application Protocol V1.1b3, 6.
#include "wire/Replies.h"

#include <gtest/gtest.h>

#include <string_view>
#include <vector>

#include "wire/Framing.h"
#include "wire/Hex.h"

namespace wire {
namespace {

constexpr Mode kModes[] = {Mode::Rtu, Mode::Ascii};

struct Exchange {
    Bytes request;  // Messages, without their checks.
    Bytes reply;
};

const Exchange kExchanges[] = {
    {{1, 1, 0, 0x13, 0, 0x13}, {1, 1, 3, 0xCD, 0x6B, 0x05}},
    {{1, 2, 0, 0xC4, 0, 0x16}, {1, 2, 3, 0xAC, 0xDB, 0x35}},
    {{1, 3, 0, 0x6B, 0, 3}, {1, 3, 6, 2, 0x2B, 0, 0, 0, 0x64}},
    {{1, 4, 0, 8, 0, 1}, {1, 4, 2, 0, 0x0A}},
    {{1, 5, 0, 0xAC, 0xFF, 0}, {1, 5, 0, 0xAC, 0xFF, 0}},
    {{1, 6, 0, 1, 0, 3}, {1, 6, 0, 1, 0, 3}},
    {{1, 15, 0, 0x13, 0, 0x0A, 2, 0xCD, 1}, {1, 15, 0, 0x13, 0, 0x0A}},
    {{1, 16, 0, 1, 0, 2, 4, 0, 0x0A, 1, 2}, {1, 16, 0, 1, 0, 2}},
    // 32-bit registers.
    {{1, 3, 0x13, 0x88, 0, 2}, {1, 3, 8, 0, 1, 2, 3, 4, 5, 6, 7}},
    {{1, 6, 0x13, 0x88, 0, 1, 2, 3}, {1, 6, 0x13, 0x88, 0, 1, 2, 3}},
};

const Bytes kRead{1, 3, 0, 0x6B, 0, 3};
const Bytes kReadReply{1, 3, 6, 2, 0x2B, 0, 0, 0, 0x64};

Request requestOf(Mode mode, const Bytes& message) {
    return requestIn(encodeFrame(mode, message)).value();
}

Answering answering(Mode mode, const Bytes& request, const Bytes& reply) {
    return answering(requestOf(mode, request), encodeFrame(mode, reply));
}

bool confusable(const Bytes& one, const Bytes& other) {
    const bool result = confusable(requestOf(Mode::Rtu, one), requestOf(Mode::Rtu, other));
    EXPECT_EQ(result, confusable(requestOf(Mode::Rtu, other), requestOf(Mode::Rtu, one)));
    EXPECT_EQ(result, confusable(requestOf(Mode::Ascii, one), requestOf(Mode::Ascii, other)));
    return result;
}

/// The message with one byte replaced.
Bytes with(Bytes message, std::size_t at, std::uint8_t byte) {
    message.at(at) = byte;
    return message;
}

std::string nameOf(Mode mode, const Bytes& request) {
    return (mode == Mode::Rtu ? "RTU " : "ASCII ") + hexText(request);
}

Bytes exceptionOf(const Bytes& request) {
    return {request[0], static_cast<std::uint8_t>(request[1] | kExceptionFlag), 2};
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

TEST(RepliesTest, TheLengthGrowsWithWhatHasComeAndNeverExceedsTheReply) {
    for (const Mode mode : kModes) {
        for (const auto& [request, reply] : kExchanges) {
            const Request asked = requestOf(mode, request);
            const Bytes frame = encodeFrame(mode, reply);
            std::size_t before = frameLength(mode, 3);
            for (std::size_t count = 0; count <= frame.size(); ++count) {
                const std::size_t length = replyLength(asked, ByteView(frame).first(count));
                EXPECT_LE(before, length) << nameOf(mode, request) << count;
                EXPECT_GE(frame.size(), length) << nameOf(mode, request) << count;
                before = length;
            }
        }
    }
}

TEST(RepliesTest, TheLengthIsKnownAsSoonAsItCanBe) {
    const Request asked = requestOf(Mode::Rtu, kRead);
    EXPECT_EQ(5U, replyLength(asked, {}));
    EXPECT_EQ(5U, replyLength(asked, Bytes{1}));
    EXPECT_EQ(11U, replyLength(asked, Bytes{1, 3}));  // 17 with long registers.
    EXPECT_EQ(11U, replyLength(asked, Bytes{1, 3, 6}));
    EXPECT_EQ(17U, replyLength(asked, Bytes{1, 3, 12}));
    EXPECT_EQ(5U, replyLength(asked, Bytes{1, 0x83}));
    const Request inAscii = requestOf(Mode::Ascii, kRead);
    EXPECT_EQ(11U, replyLength(inAscii, {}));
    EXPECT_EQ(11U, replyLength(inAscii, Bytes{':', '0', '1', '0'}));
    EXPECT_EQ(23U, replyLength(inAscii, Bytes{':', '0', '1', '0', '3'}));
}

TEST(RepliesTest, WhatBeginsOtherwiseHasNoLength) {
    const Request asked = requestOf(Mode::Rtu, kRead);
    for (const Bytes& other : {Bytes{2}, Bytes{1, 4}, Bytes{1, 0x84}, Bytes{1, 3, 4}})
        EXPECT_EQ(0U, replyLength(asked, other)) << hexText(other);
    const Request inAscii = requestOf(Mode::Ascii, kRead);
    for (const std::string_view other : {"0103", ":02", ":0g", ":010304", ":0 "})
        EXPECT_EQ(0U, replyLength(inAscii, Bytes(other.begin(), other.end()))) << other;
    const Request write = requestOf(Mode::Rtu, {1, 6, 0, 1, 0, 3});
    EXPECT_EQ(8U, replyLength(write, Bytes{1, 6, 0, 1, 0}));
    EXPECT_EQ(0U, replyLength(write, Bytes{1, 6, 0, 2}));
    EXPECT_EQ(0U, replyLength(write, Bytes{1, 6, 0, 1, 0, 4}));
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
    EXPECT_TRUE(confusable(request, Bytes{1, 43, 14, 2, 0}));
    EXPECT_FALSE(confusable(request, Bytes{2, 43, 14, 1, 0}));
    EXPECT_FALSE(confusable(request, Bytes{1, 44, 14, 1, 0}));
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

TEST(RepliesTest, ReadsOfTheSameLengthAtOnePlaceOrAnotherCanBeConfused) {
    for (const std::uint8_t function : Bytes{1, 2, 3, 4}) {
        const Bytes read{1, function, 0, 0, 0, 9};
        EXPECT_TRUE(confusable(read, read)) << +function;
        EXPECT_TRUE(confusable(read, with(read, 3, 77))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 0, 2))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 1, 5))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 5, 7))) << +function;
        EXPECT_FALSE(confusable(read, with(read, 1, function % 4 + 1))) << +function;
    }
}

TEST(RepliesTest, BitsThatFillTheSameBytesCanBeConfused) {
    EXPECT_TRUE(confusable({1, 1, 0, 0, 0, 9}, {1, 1, 0, 0, 0, 16}));
    EXPECT_FALSE(confusable({1, 1, 0, 0, 0, 9}, {1, 1, 0, 0, 0, 8}));
    EXPECT_FALSE(confusable({1, 2, 0, 0, 0, 16}, {1, 2, 0, 0, 0, 17}));
}

TEST(RepliesTest, ALongRegisterCanBeConfusedWithTwoShortOnes) {
    EXPECT_TRUE(confusable({1, 3, 0, 0, 0, 2}, {1, 3, 0x13, 0x88, 0, 1}));
    EXPECT_TRUE(confusable({1, 3, 0, 0, 0, 6}, {1, 3, 0x13, 0x88, 0, 3}));
    EXPECT_FALSE(confusable({1, 3, 0, 0, 0, 2}, {1, 3, 0, 0, 0, 3}));
    EXPECT_FALSE(confusable({1, 4, 0, 0, 0, 2}, {1, 4, 0, 0, 0, 1}));
}

TEST(RepliesTest, ReadsThatCanBeConfusedShareEveryGoodReply) {
    const auto couldAnswer = [](std::size_t count, std::size_t values) {
        return values == 2 * count || values == 4 * count;
    };
    for (std::uint8_t one = 1; one <= 62; ++one) {
        for (std::uint8_t other = 1; other <= 62; ++other) {
            bool shared = false;
            for (std::size_t values = 2; values <= 250; ++values)
                shared |= couldAnswer(one, values) && couldAnswer(other, values);
            if (shared) {
                EXPECT_TRUE(confusable({1, 3, 0, 0, 0, one}, {1, 3, 0, 9, 0, other}))
                    << +one << ' ' << +other;
            }
        }
    }
}

TEST(RepliesTest, WritesCanBeConfusedWhenTheSameComesBack) {
    const Bytes coil{1, 5, 0, 4, 0xFF, 0};
    EXPECT_TRUE(confusable(coil, coil));
    EXPECT_FALSE(confusable(coil, with(coil, 3, 5)));
    EXPECT_FALSE(confusable(coil, with(coil, 4, 0)));
    const Bytes word{1, 6, 0, 4, 1, 2};
    EXPECT_TRUE(confusable(word, word));
    EXPECT_FALSE(confusable(word, with(word, 5, 3)));
    EXPECT_FALSE(confusable(word, with(word, 0, 2)));
    const Bytes words{1, 16, 0, 4, 0, 1, 2, 7, 7};
    EXPECT_TRUE(confusable(words, with(words, 8, 8)));  // Values do not come back.
    EXPECT_FALSE(confusable(words, with(words, 3, 5)));
    EXPECT_FALSE(confusable(words, {1, 16, 0, 4, 0, 2, 4, 0, 0, 0, 0}));
    EXPECT_TRUE(confusable({1, 15, 0, 4, 0, 9, 2, 1, 1}, {1, 15, 0, 4, 0, 9, 2, 0, 0}));
    EXPECT_FALSE(confusable({1, 15, 0, 4, 0, 9, 2, 1, 1}, {1, 15, 0, 4, 0, 10, 2, 1, 1}));
}

// A master may look at no more of the value than two bytes.
TEST(RepliesTest, WritesOfLongRegistersCanBeConfusedByTheirFirstTwoBytes) {
    const Bytes write{1, 6, 0x13, 0x88, 0, 1, 0, 0};
    EXPECT_TRUE(confusable(write, with(write, 7, 1)));
    EXPECT_FALSE(confusable(write, with(write, 5, 2)));
    EXPECT_TRUE(confusable(write, {1, 6, 0x13, 0x88, 0, 1}));
}

TEST(RepliesTest, FramingsAreNotConfused) {
    EXPECT_FALSE(confusable(requestOf(Mode::Rtu, kRead), requestOf(Mode::Ascii, kRead)));
}

}  // namespace
}  // namespace wire
