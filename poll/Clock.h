// What time it is.
#pragma once

#include <chrono>

namespace poll {

/// A steady and a civil clock. A fake one moves only when told.
class Clock {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;
    using WallTime = std::chrono::system_clock::time_point;

    virtual ~Clock() = default;
    /// For periods and pauses. Threads: any.
    virtual TimePoint now() = 0;
    /// For people. Threads: any.
    virtual WallTime wall() = 0;
};

class SystemClock final : public Clock {
  public:
    TimePoint now() override { return std::chrono::steady_clock::now(); }
    WallTime wall() override { return std::chrono::system_clock::now(); }
};

}  // namespace poll
