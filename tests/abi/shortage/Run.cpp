#include "tests/abi/shortage/Run.h"

#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <exception>

#include "tests/abi/shortage/ShortMemory.h"

namespace shortage {

namespace {

/// How a child process ends.
enum Exit : int { kFine = 10, kNothingRefused, kWrong, kWrongUnrefused };

/// An operation that waits for ever is one that left a lock.
constexpr unsigned kMostSeconds = 60;

Totals totalsSoFar;

struct Outcome {
    int value = 0;
    int error = 0;
    std::string text;
    std::string buffer;
    bool operator==(const Outcome&) const = default;
};

Outcome outcomeOf(World& world, int value) {
    Outcome outcome{value, 0, {}, world.buffer()};
    if (world.protocol == nullptr) {
        outcome.text = world.module.GetLastError();
    } else if (value == 0) {
        outcome.error = world.protocol->GetLastError();
        outcome.text = world.protocol->GetLastErrorString();
    }
    return outcome;
}

/// What happens when there is memory.
struct Regular {
    Outcome outcome;
    std::string stateBefore;
    std::string state;
};

Regular runRegularly(const abi_test::Plugin& plugin, const Operation& operation) {
    Regular regular;
    {
        World untouched(plugin, operation.stage);
        operation.prepare(untouched);
        regular.stateBefore = untouched.wholeState();
    }
    World world(plugin, operation.stage);
    operation.prepare(world);
    world.clearBuffer();
    const int value = operation.call(world);
    regular.outcome = outcomeOf(world, value);
    regular.state = world.wholeState();
    return regular;
}

class Child {
  public:
    Child(const abi_test::Plugin& plugin, const Operation& operation, const Regular& regular,
          long nth, Kind kind)
        : plugin_(plugin), operation_(operation), regular_(regular), nth_(nth), kind_(kind) {}

    int run() {
        const long before = blocksAlive();
        try {
            refuseOne();
        } catch (const std::exception& caught) {
            complain(std::string("exception ") + caught.what());
        }
        if (blocksAlive() != before)
            complain(std::to_string(blocksAlive() - before) + " blocks were not given back");
        if (refused_) return wrong_ ? kWrong : kFine;
        return wrong_ ? kWrongUnrefused : kNothingRefused;
    }

  private:
    void refuseOne() {
        World world(plugin_, operation_.stage);
        operation_.prepare(world);
        world.clearBuffer();
        const std::string before = world.state();
        int value = 0;
        {
            const Refusal refusal(nth_, kind_);
            value = operation_.call(world);
            refused_ = Refusal::refused() > 0;
        }
        const Outcome outcome = outcomeOf(world, value);
        if (!world.guardsIntact()) complain("wrote outside the buffer");
        if (world.host.multiTask.locksHeld() != 0) complain("a lock is held");
        if (outcome == regular_.outcome) return compareStates(regular_.state, world.wholeState());
        if (!isRefusal(world, outcome)) complain("answered " + describe(outcome));
        compareStates(before, world.state());
        lookInside(world);
        runAgain(world);
    }

    bool isRefusal(const World& world, const Outcome& outcome) const {
        switch (operation_.refused) {
            case Refused::error:
                return outcome.value == 0 && outcome.error == -1 &&
                       outcome.text == "Out of memory" && world.bufferUntouched();
            case Refused::answer:
                return outcome.value == 1 &&
                       outcome.buffer.find("Out of memory") != std::string::npos;
            case Refused::null:
                return outcome.value == 0 && world.bufferUntouched();
        }
        return false;
    }

    /// Compares what can only be seen by calls that change it, in a copy of this process.
    void lookInside(World& world) {
        const pid_t copy = fork();
        if (copy == 0) {
            wrong_ = false;
            compareStates(regular_.stateBefore, world.wholeState());
            _exit(wrong_ ? kWrong : kFine);
        }
        int status = 0;
        waitpid(copy, &status, 0);
        if (!WIFEXITED(status) || WEXITSTATUS(status) != kFine) wrong_ = true;
    }

    void runAgain(World& world) {
        world.clearBuffer();
        const int value = operation_.call(world);
        Outcome outcome = outcomeOf(world, value);
        // Some refusals say nothing, and the text of the shortage stays.
        if (value == 0 && regular_.outcome.error == 1) {
            outcome.error = 1;
            outcome.text.clear();
        }
        if (outcome != regular_.outcome) complain("answered afterwards " + describe(outcome));
        compareStates(regular_.state, world.wholeState());
    }

    void compareStates(const std::string& expected, const std::string& state) {
        if (expected != state) complain("left\n" + state + "instead of\n" + expected);
    }

    static std::string describe(const Outcome& outcome) {
        std::string text = std::to_string(outcome.value) + ", " + std::to_string(outcome.error) +
                           " \"" + outcome.text + "\"";
        const std::size_t shown = outcome.buffer.find_first_not_of('\xA5');
        if (shown != std::string::npos)
            text += " [" + std::string(outcome.buffer.substr(shown, 40).c_str()) + ']';
        return text;
    }

    void complain(const std::string& complaint) {
        wrong_ = true;
        std::fprintf(stderr, "%s, request %ld%s: %s\n", operation_.name.c_str(), nth_,
                     kind_ == Kind::lasting ? " and all later ones" : "", complaint.c_str());
    }

    const abi_test::Plugin& plugin_;
    const Operation& operation_;
    const Regular& regular_;
    const long nth_;
    const Kind kind_;
    bool wrong_ = false;
    bool refused_ = false;
};

/// @return the wait status of a process that did it.
int statusOf(Child child) {
    std::fflush(stdout);
    std::fflush(stderr);
    const pid_t process = fork();
    if (process == 0) {
        alarm(kMostSeconds);
        _exit(child.run());
    }
    int status = 0;
    waitpid(process, &status, 0);
    return status;
}

/// @return whether there may be more to refuse.
bool count(int status, Totals& totals) {
    const int code = WIFEXITED(status) ? WEXITSTATUS(status) : 0;
    if (code == kWrong || code == kWrongUnrefused) ++totals.failed;
    if (code == kNothingRefused || code == kWrongUnrefused) return false;
    ++totals.refusals;
    if (code != kFine && code != kWrong) ++totals.ended;
    return true;
}

/// No operation asks for memory more often.
constexpr long kMostRequests = 2000;

Totals refuseEach(const abi_test::Plugin& plugin, const Operation& operation) {
    Totals totals;
    totals.operations = 1;
    const Regular regular = runRegularly(plugin, operation);
    for (const Kind kind : {Kind::once, Kind::lasting}) {
        long nth = 1;
        while (nth <= kMostRequests &&
               count(statusOf({plugin, operation, regular, nth, kind}), totals))
            ++nth;
        if (nth > kMostRequests) ++totals.failed;
    }
    if (totals.ended + totals.failed > 0)
        std::fprintf(stderr, "%s: %s\n", operation.name.c_str(), describe(totals).c_str());
    return totals;
}

}  // namespace

Totals& Totals::operator+=(const Totals& other) {
    operations += other.operations;
    refusals += other.refusals;
    ended += other.ended;
    failed += other.failed;
    return *this;
}

Totals refuseEach(const abi_test::Plugin& plugin, const std::vector<Operation>& operations) {
    Totals totals;
    for (const Operation& operation : operations)
        totals += refuseEach(plugin, operation);
    totalsSoFar += totals;
    return totals;
}

const Totals& allTotals() {
    return totalsSoFar;
}

std::string describe(const Totals& totals) {
    return std::to_string(totals.operations) + " operations, " + std::to_string(totals.refusals) +
           " refused requests, " + std::to_string(totals.ended) + " ended processes, " +
           std::to_string(totals.failed) + " with something wrong";
}

}  // namespace shortage
