#include "tests/unit/cli/Child.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <pty.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>

namespace cli_test {
namespace {

using Clock = std::chrono::steady_clock;
constexpr std::chrono::seconds kPatience{60};
constexpr uid_t kNobody = 65534;

/// However the test program was started: a script's background jobs ignore SIGINT.
void heedEndSignals() {
    for (const int number : {SIGINT, SIGTERM, SIGHUP})
        signal(number, SIG_DFL);
}

[[noreturn]] void exec(const std::vector<std::string>& words, int ignoredSignal = 0) {
    heedEndSignals();
    if (ignoredSignal != 0) signal(ignoredSignal, SIG_IGN);
    std::vector<char*> arguments{const_cast<char*>("mrtu")};
    for (const std::string& word : words)
        arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    execv(MRTU_BINARY, arguments.data());
    _exit(127);
}

struct Pipe {
    Pipe() {
        std::array<int, 2> ends{};
        if (pipe2(ends.data(), O_CLOEXEC) != 0) throw std::runtime_error("pipe2");
        reading = ends[0];
        writing = ends[1];
    }
    int reading;
    int writing;
};

/// Appends what has arrived. @return false at the end of the stream.
bool drain(int fd, std::string& text) {
    std::array<char, 4096> buffer{};
    const ssize_t count = read(fd, buffer.data(), buffer.size());
    if (count <= 0) return false;
    text.append(buffer.data(), static_cast<std::size_t>(count));
    return true;
}

int millisecondsTo(Clock::time_point deadline) {
    const auto left =
        std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Clock::now());
    return static_cast<int>(std::max<std::chrono::milliseconds::rep>(0, left.count()));
}

/// Waits for one of the descriptors. @return false when the time is up.
bool waitFor(std::array<pollfd, 2>& streams, Clock::time_point deadline) {
    return poll(streams.data(), streams.size(), millisecondsTo(deadline)) > 0;
}

void collect(pid_t pid, int out, int err, Outcome& outcome) {
    const auto deadline = Clock::now() + kPatience;
    std::array<pollfd, 2> streams{pollfd{out, POLLIN, 0}, pollfd{err, POLLIN, 0}};
    while (streams[0].fd >= 0 || streams[1].fd >= 0) {
        if (!waitFor(streams, deadline)) {
            ADD_FAILURE() << "mrtu did not come to an end";
            kill(pid, SIGKILL);
            return;
        }
        if (streams[0].revents != 0 && !drain(out, outcome.out)) streams[0].fd = -1;
        if (streams[1].revents != 0 && !drain(err, outcome.err)) streams[1].fd = -1;
    }
}

int exitCodeOf(pid_t pid) {
    int status = 0;
    if (waitpid(pid, &status, 0) != pid || !WIFEXITED(status)) return -1;
    return WEXITSTATUS(status);
}

std::string makeScratchFolder() {
    std::string pattern = testing::TempDir() + "mrtu_cli_XXXXXX";
    if (mkdtemp(pattern.data()) == nullptr) throw std::runtime_error("mkdtemp");
    chmod(pattern.c_str(), 0755);
    return pattern;
}

struct Scratch {
    std::string path = makeScratchFolder();
    ~Scratch() {
        std::error_code ignored;
        std::filesystem::remove_all(path, ignored);
    }
};

void prepareChild(const RunOptions& options) {
    setenv("XDG_STATE_HOME", scratchFolder().c_str(), 1);
    setenv("TZ", "UTC", 1);
    for (const auto& [name, value] : options.environment)
        setenv(name.c_str(), value.c_str(), 1);
    for (const std::string& name : options.unset)
        unsetenv(name.c_str());
    if (options.diskFull) {
        constexpr rlimit kNothing{0, 0};
        signal(SIGXFSZ, SIG_IGN);
        setrlimit(RLIMIT_FSIZE, &kNothing);
    }
    if (options.unprivileged && geteuid() == 0 &&
        (setresgid(kNobody, kNobody, kNobody) != 0 || setresuid(kNobody, kNobody, kNobody) != 0)) {
        _exit(126);
    }
}

}  // namespace

const std::string& scratchFolder() {
    static const Scratch scratch;
    return scratch.path;
}

std::string scratchFile(const std::string& name) {
    static int count = 0;
    return scratchFolder() + '/' + std::to_string(++count) + name;
}

std::string contentsOf(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
}

void writeFile(const std::string& path, const std::string& text) {
    std::ofstream(path, std::ios::binary) << text;
}

RunningCommand::RunningCommand(const std::vector<std::string>& words, const RunOptions& options) {
    scratchFolder();
    const Pipe in;
    const Pipe out;
    const Pipe err;
    pid_ = fork();
    if (pid_ == 0) {
        dup2(in.reading, 0);
        dup2(err.writing, 2);
        if (options.outClosed) {
            close(1);
        } else if (!options.outFile.empty()) {
            dup2(open(options.outFile.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0644), 1);
        } else {
            dup2(out.writing, 1);
        }
        prepareChild(options);
        exec(words, options.ignoredSignal);
    }
    close(in.reading);
    close(out.writing);
    close(err.writing);
    in_ = in.writing;
    out_ = out.reading;
    err_ = err.reading;
    // Shorter than a pipe holds: no write blocks here.
    EXPECT_EQ(static_cast<ssize_t>(options.input.size()),
              write(in_, options.input.data(), options.input.size()));
}

RunningCommand::~RunningCommand() {
    if (pid_ <= 0) return;
    kill(pid_, SIGKILL);
    end();
}

void RunningCommand::send(int signal) const {
    EXPECT_EQ(0, kill(pid_, signal));
}

Outcome RunningCommand::end() {
    close(in_);
    Outcome outcome;
    collect(pid_, out_, err_, outcome);
    close(out_);
    close(err_);
    outcome.exitCode = exitCodeOf(pid_);
    pid_ = -1;
    return outcome;
}

Outcome mrtu(const std::vector<std::string>& words, const RunOptions& options) {
    return RunningCommand(words, options).end();
}

RunningSim::RunningSim(const std::vector<std::string>& words) {
    const Pipe out;
    pid_ = fork();
    if (pid_ == 0) {
        dup2(out.writing, 1);
        std::vector<std::string> all{"sim"};
        all.insert(all.end(), words.begin(), words.end());
        exec(all);
    }
    close(out.writing);
    out_ = out.reading;
    const auto deadline = Clock::now() + kPatience;
    while (announcement_.find("Ctrl-C") == std::string::npos) {
        std::array<pollfd, 2> stream{pollfd{out_, POLLIN, 0}, pollfd{-1, 0, 0}};
        if (!waitFor(stream, deadline) || !drain(out_, announcement_)) {
            ADD_FAILURE() << "mrtu sim did not announce itself: " << announcement_;
            return;
        }
    }
    const std::size_t path = announcement_.find('/');
    device_ = announcement_.substr(path, announcement_.find('\n') - path);
}

RunningSim::~RunningSim() {
    if (pid_ > 0) end(SIGTERM);
    close(out_);
}

int RunningSim::end(int signal) {
    if (signal != 0) kill(pid_, signal);
    const int code = exitCodeOf(pid_);
    pid_ = -1;
    return code;
}

TerminalSession::TerminalSession(const std::vector<std::string>& words, const char* type) {
    scratchFolder();
    struct winsize size {};
    size.ws_row = 24;
    size.ws_col = 80;
    pid_ = forkpty(&terminal_, nullptr, nullptr, &size);
    if (pid_ == 0) {
        setenv("TERM", type, 1);
        prepareChild({});
        exec(words);
    }
    // Without a second holder of this end the kernel would forget its settings with the process.
    watch_ = open(ptsname(terminal_), O_RDWR | O_NOCTTY | O_CLOEXEC);
}

TerminalSession::~TerminalSession() {
    if (pid_ > 0) {
        kill(pid_, SIGKILL);
        end();
    }
    close(watch_);
    close(terminal_);
}

void TerminalSession::resize(int columns, int rows) const {
    struct winsize size {};
    size.ws_row = static_cast<unsigned short>(rows);
    size.ws_col = static_cast<unsigned short>(columns);
    EXPECT_EQ(0, ioctl(terminal_, TIOCSWINSZ, &size));
}

void TerminalSession::send(int signal) const {
    EXPECT_EQ(0, kill(pid_, signal));
}

termios TerminalSession::settings() const {
    termios now{};
    EXPECT_EQ(0, tcgetattr(watch_, &now));
    return now;
}

void TerminalSession::type(const std::string& keys) {
    EXPECT_EQ(static_cast<ssize_t>(keys.size()), write(terminal_, keys.data(), keys.size()));
}

bool TerminalSession::shows(const std::string& text) {
    const auto deadline = Clock::now() + kPatience;
    for (;;) {
        const std::size_t at = screen_.find(text, seen_);
        if (at != std::string::npos) {
            seen_ = at + text.size();
            return true;
        }
        std::array<pollfd, 2> stream{pollfd{terminal_, POLLIN, 0}, pollfd{-1, 0, 0}};
        if (!waitFor(stream, deadline) || !drain(terminal_, screen_)) return false;
    }
}

int TerminalSession::end() {
    // The kernel keeps the process in its last write until somebody reads the terminal.
    siginfo_t ended{};
    while (waitid(P_PID, static_cast<id_t>(pid_), &ended, WEXITED | WNOHANG | WNOWAIT) == 0 &&
           ended.si_pid == 0) {
        pollfd shown{terminal_, POLLIN, 0};
        constexpr int kLookAgainMs = 20;
        if (poll(&shown, 1, kLookAgainMs) > 0 && !drain(terminal_, screen_)) break;
    }
    const int code = exitCodeOf(pid_);
    pid_ = -1;
    return code;
}

}  // namespace cli_test
