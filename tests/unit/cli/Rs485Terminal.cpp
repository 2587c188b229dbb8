// Loaded in front of a program's libraries: every terminal has the kernel's RS-485 direction
// control, and what is set is written into the file that RS485_LOG names, one number a line.
#include <dlfcn.h>
#include <fcntl.h>
#include <linux/serial.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

serial_rs485 direction = [] {
    serial_rs485 found{};
    found.flags = SER_RS485_RTS_AFTER_SEND;
    return found;
}();

void note(unsigned flags) {
    char line[16];
    const int length = std::snprintf(line, sizeof line, "%u\n", flags);
    const int log = open(std::getenv("RS485_LOG"), O_WRONLY | O_CREAT | O_APPEND, 0644);
    if (write(log, line, static_cast<std::size_t>(length)) != length) std::abort();
    close(log);
}

}  // namespace

extern "C" int ioctl(int fd, unsigned long request, ...) noexcept {
    std::va_list arguments;
    va_start(arguments, request);
    void* const argument = va_arg(arguments, void*);
    va_end(arguments);
    if (request == TIOCGRS485) {
        std::memcpy(argument, &direction, sizeof direction);
        return 0;
    }
    if (request == TIOCSRS485) {
        std::memcpy(&direction, argument, sizeof direction);
        note(direction.flags);
        return 0;
    }
    using Ioctl = int (*)(int, unsigned long, ...);
    static const auto next = reinterpret_cast<Ioctl>(dlsym(RTLD_NEXT, "ioctl"));
    return next(fd, request, argument);
}
