#include "poll/CostModel.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::milliseconds;
using std::chrono::nanoseconds;

CostModel fast() {
    CostModel costs;
    costs.rate = {19200, 10};
    return costs;
}

TEST(CostModelTest, AReadCostsWhatItsTransactionTakes) {
    const CostModel costs = fast();
    for (const long items : {1L, 2L, 125L}) {
        const auto length = wire::transactionLength(wire::Mode::Rtu, wire::Form::ReadWords,
                                                    static_cast<std::size_t>(items));
        EXPECT_EQ(wire::transactionTime(wire::Mode::Rtu, costs.rate, length),
                  costs.readCost(1, 2).of(items));
        EXPECT_EQ(length.characters(), costs.readCharacters(items, 2));
    }
    for (const long bits : {1L, 8L, 9L, 2000L}) {
        const auto length = wire::transactionLength(wire::Mode::Rtu, wire::Form::ReadBits,
                                                    static_cast<std::size_t>(bits));
        EXPECT_EQ(wire::transactionTime(wire::Mode::Rtu, costs.rate, length),
                  costs.readCost(1, 0).of(bits));
        EXPECT_EQ(length.characters(), costs.readCharacters(bits, 0));
    }
}

TEST(CostModelTest, AsciiTakesTwoCharactersForAByte) {
    CostModel costs = fast();
    const nanoseconds rtu = costs.readCost(1, 2).unit;
    costs.mode = wire::Mode::Ascii;
    EXPECT_EQ(2 * rtu, costs.readCost(1, 2).unit);
}

TEST(CostModelTest, ANodesOwnTurnaroundCountsAndElseTheLines) {
    CostModel costs = fast();
    costs.turnaround = milliseconds{10};
    costs.turnarounds[3] = milliseconds{50};
    EXPECT_EQ(milliseconds{40}, costs.readCost(3, 2).request - costs.readCost(1, 2).request);
}

TEST(CostModelTest, ADriversPauseAndItsGapAreInEveryRequest) {
    CostModel costs = fast();
    const nanoseconds bare = costs.readCost(1, 2).request;
    costs.delays[1] = milliseconds{5};
    EXPECT_EQ(bare + milliseconds{5}, costs.readCost(1, 2).request);
    EXPECT_EQ(bare, costs.readCost(2, 2).request);
    costs.gapAfterReply = milliseconds{7};
    EXPECT_EQ(bare + milliseconds{7} - wire::silenceBetweenFrames(costs.rate),
              costs.readCost(2, 2).request);
}

}  // namespace
}  // namespace poll
