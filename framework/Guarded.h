// The guard that every entry ends in which another party may call.
//
// Host, engine and plug-in each carry a C++ run time of their own, and one run time cannot unwind
// through the frames of another: what is thrown in a library must be caught in it.
#pragma once

#include <utility>

/// Runs `step` and returns its result. Nothing leaves it: these libraries throw only what the
/// standard library throws when it is short of memory, and then `report` is called, which must need
/// none, and `refused` returned. What `step` did before is undone by its own means.
template <class Result, class Report, class Step>
Result guarded(Result refused, Report&& report, Step&& step) noexcept {
    try {
        return std::forward<Step>(step)();
    } catch (...) {
        std::forward<Report>(report)();
        return refused;
    }
}
