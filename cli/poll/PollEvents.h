// What a command that runs until it is told otherwise waits for: signals, keys, an output that
// nobody reads any more, or just time.
#pragma once

#include <csignal>

#include <chrono>
#include <memory>
#include <string>

namespace cli {

/// What has happened.
struct Happened {
    bool end = false;         ///< SIGINT or SIGTERM; a keyboard that is gone.
    bool reload = false;      ///< SIGHUP.
    bool resized = false;     ///< SIGWINCH.
    bool suspend = false;     ///< SIGTSTP, which then is not acted on.
    bool outputGone = false;  ///< Nobody reads standard output.
    std::string typed{};      ///< Bytes from standard input.
};

class PollEvents {
  public:
    virtual ~PollEvents() = default;
    /// Returns when anything has happened, at the latest when the time is up.
    virtual Happened wait(std::chrono::milliseconds time) = 0;
};

/// Takes the signals of the process while it lives; those that are ignored stay so. Of these
/// objects there is one at a time.
/// @param keys  Whether standard input is read, and SIGWINCH and SIGTSTP are taken.
/// Errors: std::system_error.
std::unique_ptr<PollEvents> takeEvents(bool keys);

/// Keeps the signals that are taken from the calling thread and from those that it starts
/// meanwhile: none of them is to be disturbed in a read from a port.
class SignalsHeld {
  public:
    SignalsHeld();
    ~SignalsHeld();
    SignalsHeld(const SignalsHeld&) = delete;
    SignalsHeld& operator=(const SignalsHeld&) = delete;

  private:
    sigset_t before_{};
};

}  // namespace cli
