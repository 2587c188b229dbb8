// Refuses the first, the second, ... request for memory of an operation until it needs no more, and
// looks at what each refusal leaves behind. Each refusal has a process of its own, so that one that
// ends the process is counted and the others still run.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "tests/abi/shortage/World.h"

namespace shortage {

/// How an operation says that there was no memory.
enum class Refused {
    error,   ///< 0, with -1 "Out of memory" in the protocol's error state.
    answer,  ///< The console's: 1, with "Out of memory" in the answer.
    null,    ///< 0 or null and nothing else.
};

struct Operation {
    std::string name;
    Stage stage = Stage::started;
    /// The call itself, without needs of its own. @return the call's result, non-zero for success.
    std::function<int(World&)> call;
    Refused refused = Refused::error;
    /// What has to be there before, e.g. the tag.
    std::function<void(World&)> prepare = [](World&) {};
};

struct Totals {
    int operations = 0;
    int refusals = 0;
    int ended = 0;   ///< Processes that did not end by themselves.
    int failed = 0;  ///< Processes that found something wrong.

    Totals& operator+=(const Totals& other);
};

/// Every refusal of both kinds. Complaints go to standard error.
Totals refuseEach(const abi_test::Plugin& plugin, const std::vector<Operation>& operations);

/// Of all calls of refuseEach() so far.
const Totals& allTotals();

std::string describe(const Totals& totals);

}  // namespace shortage
