// The one place where files that a user names are read.
//
// Whatever the name stands for, reading ends: a file without an end is cut off by its length, a
// pipe that stays silent by time.
#pragma once

#include <chrono>
#include <cstddef>
#include <stdexcept>
#include <string>

#include "posix/FileDescriptor.h"

namespace settings {

/// Why a file was not read: what() is the reason alone, without the file's name.
class FileError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

struct FileLimits {
    std::size_t bytes;                                             ///< The most that is taken.
    std::chrono::milliseconds silence = std::chrono::seconds(10);  ///< Of a pipe, at a stretch.
};

/// Opens a file to look into, here and there. Devices, pipes and folders are not even opened.
/// Errors: FileError.
posix::FileDescriptor openRegularFile(const std::string& path);

/// @return all bytes of a file, a pipe or a device.
/// Errors: FileError when it can't be opened or read, is longer than the limit, or stays silent.
std::string readFile(const std::string& path, const FileLimits& limits);

/// A configuration is at most this long, wherever it is read.
inline constexpr std::size_t kConfigBytes = std::size_t{1024} * 1024;
/// A list of tags; enough for a million of them.
inline constexpr std::size_t kTagListBytes = std::size_t{64} * 1024 * 1024;

/// Reads a text for the driver, which takes C strings: what stands behind a zero byte would be
/// lost without a word, so such a text is refused.
/// @param what  What the text is, for the complaint: "configuration".
/// Errors: TextError with what, path and reason.
std::string readText(const std::string& what, const std::string& path, const FileLimits& limits);

}  // namespace settings
