// Prints what a panel gets from nodes that answer later than it waits, with and without the port's
// knowledge of replies. Nothing is waited for: the clock is a simulated one.
#include <cstdio>

#include "tests/line/slow/Cell.h"

namespace {

void print(slow::Cell cell) {
    const slow::Tally knowing = run(cell);
    cell.knowsReplies = false;
    const slow::Tally blind = run(cell);
    std::printf("| %4d | %3d | %d | %3d | %3d | %3d | %7lld | %3d | %3d | %3d | %7lld |\n",
                cell.latencyMs, cell.jitterMs, cell.repeat, knowing.right, knowing.wrong,
                knowing.errors, static_cast<long long>(knowing.time.count()), blind.right,
                blind.wrong, blind.errors, static_cast<long long>(blind.time.count()));
}

void printTable(slow::Work work, slow::Habit habit, wire::Mode mode) {
    slow::Cell cell{.work = work, .mode = mode, .habit = habit, .baud = 9600};
    std::printf("\n%s\n\n", nameOf(work, habit).c_str());
    std::puts(
        "| latency | +- | repeat | right | wrong | errors | ms | right | wrong | errors | ms |");
    std::puts("|---|---|---|---|---|---|---|---|---|---|---|");
    for (const int repeat : {0, 2, 5}) {
        cell.repeat = repeat;
        for (const int latency : {10, 50, 90, 110, 120, 250, 500, 1000, 2000}) {
            cell.latencyMs = latency;
            cell.jitterMs = 0;
            print(cell);
        }
        cell.latencyMs = 100;
        cell.jitterMs = 40;
        print(cell);
    }
}

}  // namespace

int main() {
    std::puts(
        "40 accesses to one node, timeout 100 ms, RTU at 9600 baud, times in ms. First what a");
    std::puts("port that knows replies delivers, then one that does not.");
    for (const slow::Work work : {slow::Work::ReadRegisters, slow::Work::ReadMixed,
                                  slow::Work::Write, slow::Work::WriteOneAndBack})
        for (const slow::Habit habit :
             {slow::Habit::Queues, slow::Habit::Delays, slow::Habit::Drops})
            printTable(work, habit, wire::Mode::Rtu);
}
