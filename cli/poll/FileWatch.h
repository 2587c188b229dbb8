// Tells whether files have changed since they were read.
#pragma once

#include <sys/types.h>

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace cli {

/// What changes when a file's contents do, or when another file takes its name.
struct FileStamp {
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    std::int64_t modifiedNs = 0;
    bool operator==(const FileStamp&) const = default;
};

/// @return nothing when there is no such file.
std::optional<FileStamp> stampOf(const std::string& path);

/// Several files that are read together.
class FileWatch {
  public:
    /// @param paths  Empty ones are no files. What stands there now counts as read.
    explicit FileWatch(const std::vector<std::string>& paths);

    /// @return the first file that is not as it was read, or as it was at the last answer: each
    /// change is told once.
    std::optional<std::string> changed();

    /// Takes the stamps of this moment; the files are to be read now.
    void beginReading();
    /// @return the file that has changed or vanished since beginReading(), so that what was read
    /// may be neither the old nor the new text.
    [[nodiscard]] std::optional<std::string> tornFile() const;

  private:
    struct Watched {
        std::string path;
        std::optional<FileStamp> stamp;
    };
    std::vector<Watched> files_;
};

}  // namespace cli
