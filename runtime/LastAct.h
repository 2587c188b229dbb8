// What must be undone even when a signal ends the process.
#pragma once

namespace runtime {

/// Announces an undoing, such as putting a terminal's settings back, for as long as it lives.
/// Whoever catches a signal that is to end the process calls runLastActs() in the handler;
/// destructors do not run then. More than kLastActs at a time are not noted.
/// Threads: any.
class LastAct {
  public:
    /// Calls async-signal-safe functions only, may run at any moment between this object's
    /// construction and the end of its destruction, and may come after the owner's own undoing.
    using Undo = void (*)(const void* what) noexcept;

    /// @param what  Handed to `undo`; outlives this object and does not change while it lives.
    LastAct(Undo undo, const void* what);
    ~LastAct();
    LastAct(const LastAct&) = delete;
    LastAct& operator=(const LastAct&) = delete;

  private:
    int place_ = -1;
};

inline constexpr int kLastActs = 64;

/// Runs what is announced at this moment. Async-signal-safe.
void runLastActs() noexcept;

}  // namespace runtime
