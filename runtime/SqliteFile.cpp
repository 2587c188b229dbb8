// What can be told of a storage file, and made of it, without SQLite.
#include "runtime/SqliteFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <string_view>

#include "posix/FileDescriptor.h"
#include "runtime/StoragePath.h"

namespace runtime {
namespace {

using posix::FileDescriptor;

using Fault = std::optional<StorageError>;
using namespace std::string_view_literals;

constexpr std::size_t kHeaderBytes = 100;
constexpr std::string_view kMagic = "SQLite format 3\0"sv;

/// Offsets in the header; numbers are stored high byte first.
enum Offset : std::size_t {
    PageSize = 16,  // Two bytes; 1 stands for 65536.
    ChangeCounter = 24,
    PageCount = 28,
    UserVersion = 60,
    ApplicationId = 68,
    PageCountValidFor = 92,  // The change counter when the page count was written.
};

std::uint32_t numberAt(std::span<const std::uint8_t> header, std::size_t offset, int bytes = 4) {
    std::uint32_t number = 0;
    for (int i = 0; i < bytes; ++i)
        number = number << 8 | header[offset + static_cast<std::size_t>(i)];
    return number;
}

bool allows(const std::string& path, int access) {
    return ::faccessat(AT_FDCWD, path.c_str(), access, AT_EACCESS) == 0;
}

std::uint64_t sizeOf(const std::string& path) {
    struct stat info {};
    return ::stat(path.c_str(), &info) == 0 ? static_cast<std::uint64_t>(info.st_size) : 0;
}

bool hasLog(const std::string& path) {
    return sizeOf(path + "-wal") > 0 || sizeOf(path + "-journal") > 0;
}

StorageError cannotOpen(const std::string& path, const std::string& why) {
    return {StorageFault::CannotOpen, path + ": " + why};
}

Fault faultInHeader(const std::string& path) {
    const FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC));
    if (!file) return cannotOpen(path, std::strerror(errno));
    std::array<std::uint8_t, kHeaderBytes> header{};
    const ssize_t count = ::pread(file.get(), header.data(), header.size(), 0);
    if (count < 0) return cannotOpen(path, std::strerror(errno));
    Fault fault = headerFault({header.data(), static_cast<std::size_t>(count)}, sizeOf(path));
    if (fault) fault->text = path + ": " + fault->text;
    return fault;
}

/// What a log beside the file holds belongs to the file: only both together can be judged, and
/// SQLite does that. Another process may be in the middle of a change, so that a fault counts only
/// when it stays.
Fault lastingFault(const std::string& path) {
    constexpr int kLooks = 3;
    Fault fault;
    for (int look = 0; look < kLooks; ++look) {
        if (hasLog(path)) return std::nullopt;
        fault = faultInHeader(path);
        if (!fault) return std::nullopt;
    }
    return fault;
}

}  // namespace

bool isMissingOrEmpty(const std::string& path) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0) return errno == ENOENT;
    return S_ISREG(info.st_mode) && info.st_size == 0 && !hasLog(path);
}

Fault createMissing(const std::string& path) {
    if (std::string fault = makeDirectoriesFor(path); !fault.empty()) {
        return StorageError{StorageFault::NoDirectory, path + ": cannot make " + fault};
    }
    const FileDescriptor made(::open(path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
    if (made || errno == EEXIST) return std::nullopt;
    return cannotOpen(path, std::strerror(errno));
}

Fault lookAtFile(const std::string& path, StandingFile& standing) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0) return cannotOpen(path, std::strerror(errno));
    if (!S_ISREG(info.st_mode)) return cannotOpen(path, "not a regular file");
    if (!allows(path, R_OK)) return cannotOpen(path, std::strerror(errno));
    // Write protection is somebody's wish, so root, who could write all the same, follows it too.
    constexpr mode_t kAnyWrite = S_IWUSR | S_IWGRP | S_IWOTH;
    standing.writable =
        (info.st_mode & kAnyWrite) != 0 && allows(path, W_OK) && allows(directoryOf(path), W_OK);
    standing.hasLog = hasLog(path);
    return lastingFault(path);
}

Fault headerFault(std::span<const std::uint8_t> header, std::uint64_t size) {
    if (size == 0) return std::nullopt;
    const bool whole = header.size() >= kHeaderBytes;
    if (!whole || !std::equal(kMagic.begin(), kMagic.end(), header.begin())) {
        return StorageError{StorageFault::Damaged, "file is not a database"};
    }
    const std::uint32_t application = numberAt(header, ApplicationId);
    const std::uint32_t layout = numberAt(header, UserVersion);
    if (application != 0 && application != kStorageApplication) {
        return StorageError{StorageFault::Foreign, "a database of another program"};
    }
    if (application == kStorageApplication && layout > kStorageLayout) {
        return StorageError{StorageFault::Newer,
                            "layout " + std::to_string(layout) + " is not known to this version"};
    }
    const std::uint32_t written = numberAt(header, PageSize, 2);
    const std::uint64_t pageSize = written == 1 ? 65536 : written;
    const bool counted = numberAt(header, ChangeCounter) == numberAt(header, PageCountValidFor);
    const std::uint64_t pages = counted ? numberAt(header, PageCount) : 1;
    if (pageSize == 0 || size % pageSize != 0 || size < pages * pageSize) {
        return StorageError{StorageFault::Damaged, "damaged: " + std::to_string(size) +
                                                       " bytes of " + std::to_string(pages) +
                                                       " pages of " + std::to_string(pageSize)};
    }
    return std::nullopt;
}

}  // namespace runtime
