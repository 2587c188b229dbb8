#include "NullModem.h"

#include <fcntl.h>
#include <poll.h>
#include <stdlib.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

namespace peers {

namespace {

int checked(int result, const char* what) {
    if (result < 0) throw std::system_error(errno, std::generic_category(), what);
    return result;
}

}  // namespace

NullModem::End NullModem::open() {
    End end;
    end.master = checked(posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC), "posix_openpt");
    checked(grantpt(end.master), "grantpt");
    checked(unlockpt(end.master), "unlockpt");
    std::array<char, 64> path{};
    if (const int fault = ptsname_r(end.master, path.data(), path.size()))
        throw std::system_error(fault, std::generic_category(), "ptsname_r");
    end.path = path.data();

    // Held open and raw: no end of file between two programs, no echo before the first one.
    end.slave = checked(::open(end.path.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC), "open");
    termios raw{};
    checked(tcgetattr(end.slave, &raw), "tcgetattr");
    cfmakeraw(&raw);
    checked(tcsetattr(end.slave, TCSANOW, &raw), "tcsetattr");
    return end;
}

NullModem::NullModem() : ends_{open(), open()} {
    checked(pipe2(stop_.data(), O_CLOEXEC), "pipe2");
    relay_ = std::thread(&NullModem::relay, this);
}

NullModem::~NullModem() {
    close(stop_[1]);
    relay_.join();
    close(stop_[0]);
    for (const End& end : ends_) {
        close(end.slave);
        close(end.master);
    }
}

void NullModem::relay() const {
    constexpr int kForEver = -1;
    for (;;) {
        std::array<pollfd, 3> waits{pollfd{ends_[0].master, POLLIN, 0},
                                    pollfd{ends_[1].master, POLLIN, 0},
                                    pollfd{stop_[0], POLLIN, 0}};
        if (poll(waits.data(), waits.size(), kForEver) < 0 && errno != EINTR) return;
        if (waits[2].revents != 0) return;
        if (waits[0].revents != 0 && !pass(ends_[0].master, ends_[1].master)) return;
        if (waits[1].revents != 0 && !pass(ends_[1].master, ends_[0].master)) return;
    }
}

bool NullModem::pass(int from, int to) {
    std::array<unsigned char, 512> bytes{};
    const ssize_t count = read(from, bytes.data(), bytes.size());
    if (count <= 0) return count < 0 && errno == EINTR;
    return write(to, bytes.data(), static_cast<std::size_t>(count)) == count;
}

}  // namespace peers
