// The signals that end the command: Ctrl-C (SIGINT), SIGTERM and SIGHUP.
#pragma once

#include <csignal>

namespace cli {

inline constexpr int kEndSignals[] = {SIGINT, SIGTERM, SIGHUP};

/// Tells whether a signal is ignored at this moment. One that was ignored at the start stays so:
/// `nohup`, `trap '' INT` and a script's background job mean it.
bool isIgnored(int signal);

/// From now on an end signal puts back the settings of open ports and of the terminal, and ends the
/// process at once with exit code 128 + signal. What is printed but not yet written is lost.
void endOnSignals();

/// Takes the end signals back from a library that has put its own handlers in place since
/// endOnSignals(); does nothing when that was never called. Threads: the one that called it.
void retakeEndSignals();

}  // namespace cli
