// Compares what stat(2) tells.
#include "cli/poll/FileWatch.h"

#include <sys/stat.h>

namespace cli {

std::optional<FileStamp> stampOf(const std::string& path) {
    struct stat facts {};
    if (stat(path.c_str(), &facts) != 0) return {};
    constexpr std::int64_t kSecond = 1'000'000'000;
    return FileStamp{facts.st_dev, facts.st_ino, facts.st_size,
                     std::int64_t{facts.st_mtim.tv_sec} * kSecond + facts.st_mtim.tv_nsec};
}

FileWatch::FileWatch(const std::vector<std::string>& paths) {
    for (const std::string& path : paths) {
        if (!path.empty()) files_.push_back({path, {}});
    }
    beginReading();
}

std::optional<std::string> FileWatch::changed() {
    std::optional<std::string> first;
    for (Watched& file : files_) {
        const auto now = stampOf(file.path);
        if (now == file.stamp) continue;
        file.stamp = now;
        if (!first) first = file.path;
    }
    return first;
}

void FileWatch::beginReading() {
    for (Watched& file : files_)
        file.stamp = stampOf(file.path);
}

std::optional<std::string> FileWatch::tornFile() const {
    for (const Watched& file : files_) {
        if (stampOf(file.path) != file.stamp) return file.path;
    }
    return {};
}

}  // namespace cli
