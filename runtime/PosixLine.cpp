// Reads, writes and polls a file descriptor, and discards what waits in it.
#include "runtime/PosixLine.h"

#include <poll.h>
#include <sys/ioctl.h>
#include <termios.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <ctime>
#include <thread>
#include <utility>

namespace runtime {
namespace {

/// What is left until a moment; zero when it is past.
timespec leftUntil(Line::TimePoint until) {
    using std::chrono::nanoseconds;
    using std::chrono::seconds;
    const auto left = std::max(nanoseconds{0}, nanoseconds(until - Line::Clock::now()));
    const auto whole = std::chrono::duration_cast<seconds>(left);
    timespec time{};
    time.tv_sec = static_cast<time_t>(whole.count());
    time.tv_nsec = static_cast<long>((left - whole).count());
    return time;
}

}  // namespace

WaitResult PosixLine::waitReadable(TimePoint until) {
    const WaitResult result = wait(POLLIN, until);
    readable_ = result == WaitResult::Ready;
    return result;
}

WaitResult PosixLine::waitWritable(TimePoint until) {
    return wait(POLLOUT, until);
}

WaitResult PosixLine::wait(short event, TimePoint until) {
    if (gone_) return WaitResult::Gone;
    for (;;) {
        pollfd watched{fd_, event, 0};
        const timespec left = leftUntil(until);
        const int ready = ::ppoll(&watched, 1, &left, nullptr);
        if (ready < 0 && errno == EINTR) continue;
        if (ready == 0) return WaitResult::TimedOut;
        // What arrived before a hang-up may still be read; read() then finds the end itself.
        if (ready > 0 && event == POLLIN && (watched.revents & POLLIN) != 0) {
            return WaitResult::Ready;
        }
        if (ready > 0 && watched.revents == event) return WaitResult::Ready;
        gone_ = true;
        return WaitResult::Gone;
    }
}

void PosixLine::sleepUntil(TimePoint until) {
    std::this_thread::sleep_until(until);
}

/// A read that finds nothing first waits for the kernel's worker, which may be just ending the last
/// delivery: another 20 us and a wake-up. Asking how much is there does not wait. What can't be
/// asked is read, which then tells why.
bool PosixLine::isEmpty() const {
    int waiting = 0;
    return ::ioctl(fd_, FIONREAD, &waiting) == 0 && waiting == 0;
}

Moved PosixLine::read(std::span<std::uint8_t> buffer) {
    if (gone_) return {0, true};
    if (!std::exchange(readable_, false) && isEmpty()) return {0, false};
    ssize_t got = 0;
    do {
        got = ::read(fd_, buffer.data(), buffer.size());
    } while (got < 0 && errno == EINTR);
    if (got == 0) gone_ = true;
    return moved(got);
}

Moved PosixLine::write(std::span<const std::uint8_t> data) {
    if (gone_) return {0, true};
    ssize_t put = 0;
    do {
        put = ::write(fd_, data.data(), data.size());
    } while (put < 0 && errno == EINTR);
    return moved(put);
}

Moved PosixLine::moved(long result) {
    if (result < 0 && errno != EAGAIN && errno != EWOULDBLOCK) gone_ = true;
    if (gone_) return {0, true};
    return {static_cast<std::size_t>(std::max(0L, result)), false};
}

std::size_t PosixLine::unsent() {
    int queued = 0;
    if (gone_ || ::ioctl(fd_, TIOCOUTQ, &queued) != 0) return 0;
    return static_cast<std::size_t>(std::max(0, queued));
}

void PosixLine::discardInput() {
    if (!gone_) ::tcflush(fd_, TCIFLUSH);
}

void PosixLine::discardOutput() {
    if (!gone_) ::tcflush(fd_, TCOFLUSH);
}

}  // namespace runtime
