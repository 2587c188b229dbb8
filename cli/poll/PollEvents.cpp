// Signals through a pipe, so that one poll(2) waits for everything.
#include "cli/poll/PollEvents.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <system_error>

#include "cli/EndSignals.h"
#include "posix/FileDescriptor.h"

namespace cli {
namespace {

std::atomic<int> g_signalPipe{-1};

extern "C" void noteSignal(int signal) {
    const int saved = errno;
    const auto byte = static_cast<unsigned char>(signal);
    // A full pipe holds enough to wake up for.
    [[maybe_unused]] const ssize_t written = write(g_signalPipe.load(), &byte, 1);
    errno = saved;
}

constexpr std::array kSignals{SIGINT, SIGTERM, SIGHUP, SIGWINCH, SIGTSTP};
constexpr std::size_t kWithoutKeys = 3;

class SignalsAndKeys final : public PollEvents {
  public:
    explicit SignalsAndKeys(bool keys) : keys_(keys) {
        int ends[2];
        if (pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0)
            throw std::system_error(errno, std::generic_category(), "pipe");
        read_ = posix::FileDescriptor(ends[0]);
        write_ = posix::FileDescriptor(ends[1]);
        g_signalPipe.store(write_.get());
        for (std::size_t i = 0; i < (keys ? kSignals.size() : kWithoutKeys); ++i)
            take(i);
    }
    ~SignalsAndKeys() override {
        for (std::size_t i = 0; i < kSignals.size(); ++i) {
            if (taken_[i]) sigaction(kSignals[i], &old_[i], nullptr);
        }
        g_signalPipe.store(-1);
    }
    SignalsAndKeys(const SignalsAndKeys&) = delete;
    SignalsAndKeys& operator=(const SignalsAndKeys&) = delete;

    Happened wait(std::chrono::milliseconds time) override {
        // A descriptor below 0 is passed over. Without asked events only errors are told: the
        // other end of standard output is gone.
        std::array<pollfd, 3> watched{pollfd{read_.get(), POLLIN, 0},
                                      pollfd{keys_ ? STDIN_FILENO : -1, POLLIN, 0},
                                      pollfd{outputGone_ ? -1 : STDOUT_FILENO, 0, 0}};
        Happened happened;
        if (poll(watched.data(), watched.size(), static_cast<int>(time.count())) <= 0)
            return happened;
        if (watched[0].revents != 0) readSignals(happened);
        if (watched[1].revents != 0) readKeys(happened);
        if (watched[2].revents != 0) happened.outputGone = outputGone_ = true;
        return happened;
    }

  private:
    void take(std::size_t number) {
        if (isIgnored(kSignals[number])) return;
        struct sigaction action {};
        action.sa_handler = noteSignal;
        action.sa_flags = SA_RESTART;
        taken_[number] = sigaction(kSignals[number], &action, &old_[number]) == 0;
    }

    void readSignals(Happened& happened) const {
        std::array<unsigned char, 64> signals{};
        const ssize_t count = read(read_.get(), signals.data(), signals.size());
        for (ssize_t i = 0; i < count; ++i) {
            const int signal = signals[static_cast<std::size_t>(i)];
            happened.end |= signal == SIGINT || signal == SIGTERM;
            happened.reload |= signal == SIGHUP;
            happened.resized |= signal == SIGWINCH;
            happened.suspend |= signal == SIGTSTP;
        }
    }

    void readKeys(Happened& happened) {
        std::array<char, 256> typed{};
        const ssize_t count = read(STDIN_FILENO, typed.data(), typed.size());
        if (count > 0) {
            happened.typed.assign(typed.data(), static_cast<std::size_t>(count));
        } else if (count == 0 || (errno != EINTR && errno != EAGAIN)) {
            happened.end = true;
            keys_ = false;
        }
    }

    bool keys_;
    bool outputGone_ = false;
    posix::FileDescriptor read_, write_;
    std::array<struct sigaction, kSignals.size()> old_{};
    std::array<bool, kSignals.size()> taken_{};
};

}  // namespace

std::unique_ptr<PollEvents> takeEvents(bool keys) {
    return std::make_unique<SignalsAndKeys>(keys);
}

SignalsHeld::SignalsHeld() {
    sigset_t held;
    sigemptyset(&held);
    for (const int signal : kSignals)
        sigaddset(&held, signal);
    pthread_sigmask(SIG_BLOCK, &held, &before_);
}

SignalsHeld::~SignalsHeld() {
    pthread_sigmask(SIG_SETMASK, &before_, nullptr);
}

}  // namespace cli
