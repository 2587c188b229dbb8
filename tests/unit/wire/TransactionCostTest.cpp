#include "wire/TransactionCost.h"

#include <gtest/gtest.h>

#include "wire/Bytes.h"

namespace wire {
namespace {

using std::chrono::milliseconds;
using std::chrono::nanoseconds;

struct LengthCase {
    std::uint8_t function;
    std::size_t count;
    TransactionLength rtu;
    TransactionLength ascii;
};

// Counted by hand from Modbus Application Protocol V1.1b3, 6.1 to 6.6, 6.11, 6.12.
constexpr std::array kLengths{
    LengthCase{1, 1, {8, 6}, {17, 13}},       LengthCase{1, 8, {8, 6}, {17, 13}},
    LengthCase{2, 9, {8, 7}, {17, 15}},       LengthCase{2, 2000, {8, 255}, {17, 511}},
    LengthCase{3, 1, {8, 7}, {17, 15}},       LengthCase{4, 125, {8, 255}, {17, 511}},
    LengthCase{5, 1, {8, 8}, {17, 17}},       LengthCase{6, 1, {8, 8}, {17, 17}},
    LengthCase{15, 10, {11, 8}, {23, 17}},    LengthCase{16, 2, {13, 8}, {27, 17}},
    LengthCase{16, 123, {255, 8}, {511, 17}},
};

TEST(TransactionCostTest, EveryFunctionHasItsLengthInBothModes) {
    for (const LengthCase& each : kLengths) {
        const Form form = functionRow(each.function)->form;
        const TransactionLength rtu = transactionLength(Mode::Rtu, form, each.count);
        const TransactionLength ascii = transactionLength(Mode::Ascii, form, each.count);
        EXPECT_EQ(each.rtu.request, rtu.request) << +each.function << ", " << each.count;
        EXPECT_EQ(each.rtu.reply, rtu.reply) << +each.function << ", " << each.count;
        EXPECT_EQ(each.ascii.request, ascii.request) << +each.function << ", " << each.count;
        EXPECT_EQ(each.ascii.reply, ascii.reply) << +each.function << ", " << each.count;
    }
}

TEST(TransactionCostTest, TheLengthIsThatOfTheFrameThatIsSent) {
    const Bytes question{1, 3, 0, 9, 0, 1};
    const Bytes answer{1, 3, 2, 3, 0xF1};
    for (const Mode mode : {Mode::Rtu, Mode::Ascii}) {
        const TransactionLength length = transactionLength(mode, Form::ReadWords, 1);
        EXPECT_EQ(encodeFrame(mode, question).size(), length.request);
        EXPECT_EQ(encodeFrame(mode, answer).size(), length.reply);
    }
}

TEST(TransactionCostTest, RegistersOf32BitsTakeFourBytes) {
    const TransactionLength read =
        transactionLength(Mode::Rtu, Form::ReadWords, 62, kLongRegisterBytes);
    EXPECT_EQ(8U, read.request);
    EXPECT_EQ(5U + 62 * 4, read.reply);
    const TransactionLength write =
        transactionLength(Mode::Rtu, Form::WriteWord, 1, kLongRegisterBytes);
    EXPECT_EQ(10U, write.request);
    EXPECT_EQ(10U, write.reply);
}

TEST(TransactionCostTest, AnRtuTransactionHoldsTwoSilences) {
    // 15 characters and twice 3.5 of them, 10 bits each: 220 bits at 19,200 bit/s.
    const nanoseconds time =
        transactionTime(Mode::Rtu, {19200, 10}, transactionLength(Mode::Rtu, Form::ReadWords, 1));
    EXPECT_LE(nanoseconds(220'000'000'000 / 19200), time);
    EXPECT_GE(nanoseconds(220'000'000'000 / 19200 + 20), time);
}

TEST(TransactionCostTest, AsciiFramesNeedNoSilence) {
    const LineRate rate{9600, 10};
    const TransactionLength length = transactionLength(Mode::Ascii, Form::ReadWords, 1);
    EXPECT_EQ(timeOfCharacters(1, rate) * 32, transactionTime(Mode::Ascii, rate, length));
}

TEST(TransactionCostTest, AMeasuredTurnaroundHoldsTheSilenceThatTheSlaveWaits) {
    const LineRate rate{9600, 10};
    const nanoseconds silence = silenceBetweenFrames(rate);
    EXPECT_EQ(2 * silence, pauseTime(Mode::Rtu, rate, {}));
    EXPECT_EQ(2 * silence, pauseTime(Mode::Rtu, rate, {.turnaround = milliseconds{1}}));
    EXPECT_EQ(milliseconds{20} + silence,
              pauseTime(Mode::Rtu, rate, {.turnaround = milliseconds{20}}));
    EXPECT_EQ(milliseconds{20}, pauseTime(Mode::Ascii, rate, {.turnaround = milliseconds{20}}));
}

TEST(TransactionCostTest, TheMastersOwnPausesCount) {
    const LineRate rate{19200, 10};
    const nanoseconds silence = silenceBetweenFrames(rate);
    EXPECT_EQ(milliseconds{5 + 7} + silence,
              pauseTime(Mode::Rtu, rate, {.before = milliseconds{5}, .after = milliseconds{7}}));
    EXPECT_EQ(milliseconds{7}, pauseTime(Mode::Ascii, rate, {.after = milliseconds{7}}));
}

TEST(TransactionCostTest, EveryCharacterCostsTheSame) {
    const LineRate rate{115200, 11};
    const auto timeOf = [rate](std::size_t count) {
        return transactionTime(Mode::Rtu, rate,
                               transactionLength(Mode::Rtu, Form::ReadWords, count));
    };
    for (std::size_t count = 1; count < 124; ++count)
        EXPECT_EQ(timeOf(count + 1) - timeOf(count), timeOf(count + 2) - timeOf(count + 1));
}

}  // namespace
}  // namespace wire
