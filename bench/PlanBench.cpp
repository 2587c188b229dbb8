// How long the planning of reads takes, and what a plan saves on the line.
//
// Prints two tables. Planning: milliseconds for mixed tags of one period, and of five periods;
// between two rows tags grow tenfold, and so may the time, by a little more. Line: what reading
// every tag once takes by the cost model, for 1,000 mixed shuffled tags of four areas of one node
// at 19,200 baud, no gap and no turnaround but the standard's silences.
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <random>

#include "poll/Rivals.h"

namespace {

using poll::TagPlace;
using std::chrono::milliseconds;

enum class Periods : std::uint8_t { One, Five };

struct Area {
    const char* name;
    bool bits;
};
constexpr std::array kAreas{Area{"OUTP", true}, Area{"INP", true}, Area{"HREG", false},
                            Area{"IREG", false}};
constexpr std::array kPeriods{milliseconds{100}, milliseconds{250}, milliseconds{1000},
                              milliseconds{5000}, milliseconds{60000}};

/// Tags as panels have them: bits and registers of one to four items, some close together.
std::vector<TagPlace> mixedTags(int count, int nodes, long reach, Periods periods) {
    std::mt19937 random(42);
    const auto upTo = [&random](long most) {
        return static_cast<long>(random() % static_cast<unsigned long>(most + 1));
    };
    std::vector<TagPlace> tags(static_cast<std::size_t>(count));
    for (TagPlace& tag : tags) {
        const Area& area = kAreas[static_cast<std::size_t>(upTo(3))];
        tag.node = static_cast<int>(1 + upTo(nodes - 1));
        tag.area = area.name;
        tag.bits = area.bits;
        tag.itemBytes = area.bits ? 0 : 2;
        tag.first = upTo(reach);
        tag.items = area.bits ? 1 : 1L << upTo(2);
        if (periods == Periods::Five) tag.period = kPeriods[static_cast<std::size_t>(upTo(4))];
    }
    return tags;
}

poll::CostModel line() {
    poll::CostModel costs;
    costs.rate = {19200, 10};
    return costs;
}

/// The best of several runs.
double planningMs(const std::vector<TagPlace>& tags, std::size_t& blocks) {
    double best = 1e9;
    for (int run = 0; run < 5; ++run) {
        const auto begin = std::chrono::steady_clock::now();
        const poll::Plan plan = poll::makePlan(tags, {}, line());
        const std::chrono::duration<double, std::milli> took =
            std::chrono::steady_clock::now() - begin;
        best = std::min(best, took.count());
        blocks = plan.blocks.size();
    }
    return best;
}

void printPlanning() {
    std::printf("| tags | nodes | blocks | ms | blocks, five periods | ms, five periods |\n");
    std::printf("|---|---|---|---|---|---|\n");
    for (const int count : {1000, 10'000, 100'000}) {
        // Four tags in a hundred items, whatever their number.
        const int nodes = std::max(1, count / 5000);
        const long reach = 100L * count / 4 / nodes / 4;
        std::size_t one = 0;
        std::size_t five = 0;
        const double msOne = planningMs(mixedTags(count, nodes, reach, Periods::One), one);
        const double msFive = planningMs(mixedTags(count, nodes, reach, Periods::Five), five);
        std::printf("| %d | %d | %zu | %.2f | %zu | %.2f |\n", count, nodes, one, msOne, five,
                    msFive);
    }
}

void printSums(const char* name, const poll::Plan& plan, const poll::PlanSums& best) {
    const poll::PlanSums sums = poll::sumsOf(plan, {}, line());
    const auto seconds = [](std::chrono::nanoseconds time) {
        return std::chrono::duration<double>(time).count();
    };
    std::printf("| %s | %ld | %zu | %.2f | %.2f |\n", name, sums.requests, sums.characters,
                seconds(sums.once), seconds(sums.once) / seconds(best.once));
}

/// A cost model by which only the number of requests counts.
poll::CostModel requestsOnly() {
    poll::CostModel costs = line();
    costs.turnaround = std::chrono::hours{1};
    return costs;
}

void printLine() {
    const auto tags = mixedTags(1000, 1, 2000, Periods::One);
    const poll::Plan plan = poll::makePlan(tags, {}, line());
    const poll::PlanSums best = poll::sumsOf(plan, {}, line());
    std::printf("| plan | requests | characters | s | to least time |\n|---|---|---|---|---|\n");
    printSums("least time", plan, best);
    poll::Plan fewest = poll::makePlan(tags, {}, requestsOnly());
    for (poll::Block& block : fewest.blocks)
        block.cost = line().readCost(1, block.bits ? 0 : block.itemBytes).of(block.items);
    printSums("fewest requests", fewest, best);
    printSums("one request a tag", poll::planOfSingles(tags, {}, line()), best);
    for (const long gap : poll::kFixedGaps)
        printSums(("fixed gap " + std::to_string(gap)).c_str(),
                  poll::planOfFixedGap(tags, gap, {}, line()), best);
}

}  // namespace

int main() {
    printPlanning();
    std::printf("\n");
    printLine();
    return 0;
}
