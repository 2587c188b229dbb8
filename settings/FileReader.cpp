#include "settings/FileReader.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>

#include "settings/TextError.h"

namespace settings {
namespace {

constexpr std::size_t kMebibyte = std::size_t{1024} * 1024;

[[noreturn]] void refuseByErrno() {
    throw FileError(std::strerror(errno));
}

std::string sizeText(std::size_t bytes) {
    return bytes % kMebibyte == 0 ? fmt::format("{} MiB", bytes / kMebibyte)
                                  : fmt::format("{} bytes", bytes);
}

/// Opening neither waits for the other end of a pipe nor makes a terminal this process's own.
posix::FileDescriptor openForReading(const std::string& path) {
    posix::FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
    if (!file) refuseByErrno();
    return file;
}

/// Waits until there is something to read, or the end. A pipe that nobody writes to yet has
/// neither.
void awaitBytes(int fd, std::chrono::milliseconds silence) {
    pollfd waiting{fd, POLLIN, 0};
    int ready = 0;
    do {
        ready = ::poll(&waiting, 1, static_cast<int>(silence.count()));
    } while (ready < 0 && errno == EINTR);
    if (ready < 0) refuseByErrno();
    if (ready == 0)
        throw FileError(
            fmt::format("nothing came for {:g} s", std::chrono::duration<double>(silence).count()));
}

/// @return the bytes read; 0 at the end.
std::size_t readSome(int fd, char* buffer, std::size_t size, std::chrono::milliseconds silence) {
    for (;;) {
        awaitBytes(fd, silence);
        const ssize_t count = ::read(fd, buffer, size);
        if (count >= 0) return static_cast<std::size_t>(count);
        if (errno != EINTR && errno != EAGAIN) refuseByErrno();
    }
}

}  // namespace

posix::FileDescriptor openRegularFile(const std::string& path) {
    struct stat status {};
    if (::stat(path.c_str(), &status) != 0) refuseByErrno();
    if (!S_ISREG(status.st_mode)) throw FileError("not a regular file");
    return openForReading(path);
}

std::string readFile(const std::string& path, const FileLimits& limits) {
    const posix::FileDescriptor file = openForReading(path);
    std::array<char, 65536> buffer{};
    std::string bytes;
    while (const std::size_t count =
               readSome(file.get(), buffer.data(), buffer.size(), limits.silence)) {
        if (count > limits.bytes - bytes.size()) {
            throw FileError(fmt::format("longer than {}", sizeText(limits.bytes)));
        }
        bytes.append(buffer.data(), count);
    }
    return bytes;
}

std::string readText(const std::string& what, const std::string& path, const FileLimits& limits) {
    const auto refuse = [&](const char* why) {
        throw TextError(fmt::format("{} {}: {}", what, path, why));
    };
    std::string text;
    try {
        text = readFile(path, limits);
    } catch (const FileError& error) {
        refuse(error.what());
    }
    if (text.find('\0') != std::string::npos) refuse("holds a zero byte");
    return text;
}

}  // namespace settings
