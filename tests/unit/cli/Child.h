// The command as its users run it: a process with arguments, streams and an exit code.
#pragma once

#include <sys/types.h>
#include <termios.h>

#include <string>
#include <utility>
#include <vector>

namespace cli_test {

struct Outcome {
    int exitCode = -1;  ///< -1 when a signal ended the process.
    std::string out;
    std::string err;
};

struct RunOptions {
    std::string input{};        ///< What standard input holds; then it ends.
    std::string outFile{};      ///< Where standard output goes instead of Outcome::out.
    bool outClosed = false;     ///< The process starts without a standard output.
    bool unprivileged = false;  ///< Root's tests run it as somebody who may do little.
    bool diskFull = false;      ///< No file can grow.
    int ignoredSignal = 0;      ///< As `nohup` does with SIGHUP; the other end signals are heeded.
    std::vector<std::pair<std::string, std::string>> environment{};  ///< Variables to set ...
    std::vector<std::string> unset{};                                ///< ... and to take away.
};

/// `mrtu` in the background; its standard input ends with end(). Killed by the destructor at the
/// latest.
class RunningCommand {
  public:
    explicit RunningCommand(const std::vector<std::string>& words, const RunOptions& options = {});
    ~RunningCommand();
    RunningCommand(const RunningCommand&) = delete;
    RunningCommand& operator=(const RunningCommand&) = delete;

    void send(int signal) const;
    /// Waits for the end, at most a minute.
    Outcome end();

  private:
    pid_t pid_ = -1;
    int in_ = -1;
    int out_ = -1;
    int err_ = -1;
};

/// Runs `mrtu` with these words and waits for its end, at most a minute. The default storage lies
/// in scratchFolder().
Outcome mrtu(const std::vector<std::string>& words, const RunOptions& options = {});

/// @return a folder of this test program, removed at its end. Anybody may look into it.
const std::string& scratchFolder();

/// @return a path in scratchFolder() that nothing had so far.
std::string scratchFile(const std::string& name);

std::string contentsOf(const std::string& path);
void writeFile(const std::string& path, const std::string& text);

/// `mrtu sim` in the background; ended by SIGTERM at the latest in the destructor.
class RunningSim {
  public:
    explicit RunningSim(const std::vector<std::string>& words);
    ~RunningSim();
    RunningSim(const RunningSim&) = delete;
    RunningSim& operator=(const RunningSim&) = delete;

    const std::string& device() const { return device_; }
    const std::string& announcement() const { return announcement_; }
    /// Sends a signal (0: none) and waits for the end. @return the exit code, -1 after a signal.
    int end(int signal);

  private:
    pid_t pid_ = -1;
    int out_ = -1;
    std::string announcement_;
    std::string device_;
};

/// `mrtu` at a terminal of its own.
class TerminalSession {
  public:
    /// @param type  What TERM says; "dumb": nothing can be drawn.
    explicit TerminalSession(const std::vector<std::string>& words, const char* type = "dumb");
    ~TerminalSession();
    TerminalSession(const TerminalSession&) = delete;
    TerminalSession& operator=(const TerminalSession&) = delete;

    void type(const std::string& keys);
    void resize(int columns, int rows) const;
    void send(int signal) const;
    /// The terminal's settings at this moment; they outlast the process.
    termios settings() const;
    /// Reads until the screen has shown `text` behind what was waited for before.
    /// @return false when it does not come within a minute.
    bool shows(const std::string& text);
    int end();
    const std::string& screen() const { return screen_; }

  private:
    pid_t pid_ = -1;
    int terminal_ = -1;
    int watch_ = -1;
    std::string screen_;
    std::size_t seen_ = 0;
};

}  // namespace cli_test
