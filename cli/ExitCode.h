// The exit codes of the command `mrtu` and how failures become one.
#pragma once

#include <stdexcept>
#include <string>

namespace cli {

/// What the process tells its caller; documented in docs/command-line.md.
enum class ExitCode : int {
    Done = 0,        ///< Everything asked for was done.
    Other = 1,       ///< Anything that no other code names.
    Usage = 2,       ///< Wrong command line, configuration, tag URI or value.
    Port = 3,        ///< The serial port can't be opened or is gone.
    NoResponse = 4,  ///< A device did not answer.
    BadReply = 5,    ///< A device answered with an exception or with what no request asked for.
};

/// @param code  What IProtocol::GetLastError() answers after a failed read or write.
constexpr ExitCode exitCodeOf(int code) {
    if (code == -4) return ExitCode::NoResponse;
    if (code == -6) return ExitCode::BadReply;
    return ExitCode::Other;
}

/// Keeps the first failure of several steps: it decides the exit code.
class FirstFailure {
  public:
    void note(ExitCode code) {
        if (code_ == ExitCode::Done) code_ = code;
    }
    [[nodiscard]] ExitCode code() const { return code_; }

  private:
    ExitCode code_ = ExitCode::Done;
};

/// Ends a command: what() is one line for the user, without "mrtu: " and line end.
/// Thrown inside cli/ only, caught by runCommandLine().
class CommandError : public std::runtime_error {
  public:
    CommandError(ExitCode code, const std::string& text) : std::runtime_error(text), code_(code) {}
    [[nodiscard]] ExitCode code() const { return code_; }

  private:
    ExitCode code_;
};

}  // namespace cli
